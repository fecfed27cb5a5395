#include <QImage>
#include <fstream>

#include <gmock/gmock.h>

#include "platform/InterfaceVersion.h"
#include "tests/quorl/QuorlProcess.h"
#include "tests/quorl/SampleMusic.h"

namespace quorl::tests {

namespace {

using testing::AllOf;
using testing::HasSubstr;

/// A copy of the real plug-in in a directory of its own, for a test to break.
class BrokenPlugin : public testing::Test {
  protected:
    BrokenPlugin() {
        std::filesystem::copy(PLUGIN_DIRECTORY, bundle_, std::filesystem::copy_options::recursive);
    }

    void registerAs(const std::string& text) const {
        std::ofstream(bundle_ / "registration.json") << text;
    }

    /// Replaces text of the registration.
    void registerWith(const std::string& text, const std::string& replacement) const {
        std::ifstream stream(bundle_ / "registration.json");
        std::string whole{std::istreambuf_iterator<char>(stream), {}};
        whole.replace(whole.find(text), text.size(), replacement);
        registerAs(whole);
    }

    /// The page in a terminal, in one line.
    [[nodiscard]] std::string page() const {
        QuorlProcess quorl({"--text", "--plugins", plugins_.path().string()});
        EXPECT_EQ(quorl.end(), 0) << quorl.errors();
        std::string text = quorl.output();
        std::ranges::replace(text, '\n', ' ');
        return text;
    }

    SampleMusic music_;
    TemporaryDirectory plugins_;
    std::filesystem::path bundle_ = plugins_ / "Broken.bundle";
    std::filesystem::path library_ = bundle_ / "libVeloraMusic.so";
};

TEST_F(BrokenPlugin, wholeCopyIsShown) { EXPECT_THAT(page(), HasSubstr("Synced Playlist: None")); }

TEST_F(BrokenPlugin, registrationThatIsNoJsonIsNamed) {
    registerAs("{");
    EXPECT_THAT(page(), AllOf(HasSubstr("Broken.bundle/registration.json"),
                              HasSubstr("not a JSON object")));
}

TEST_F(BrokenPlugin, missingRegistrationIsNamed) {
    std::filesystem::remove(bundle_ / "registration.json");
    EXPECT_THAT(page(), AllOf(HasSubstr("Broken.bundle/registration.json"), HasSubstr("missing")));
}

TEST_F(BrokenPlugin, otherInterfaceVersionIsTold) {
    registerWith("\"interfaceVersion\": " + std::to_string(QuorlInterfaceVersion),
                 "\"interfaceVersion\": 99");
    EXPECT_THAT(page(),
                AllOf(HasSubstr("Broken.bundle/registration.json"), HasSubstr("version 99")));
}

TEST_F(BrokenPlugin, missingLibraryIsNamed) {
    std::filesystem::remove(library_);
    EXPECT_THAT(page(), HasSubstr("Broken.bundle/libVeloraMusic.so"));
}

TEST_F(BrokenPlugin, missingRootClassIsNamed) {
    registerWith("LMQuorlSettingsController", "NoSuchController");
    EXPECT_THAT(page(),
                AllOf(HasSubstr("Broken.bundle/libVeloraMusic.so"), HasSubstr("NoSuchController")));
}

class ShortLibrary : public BrokenPlugin, public testing::WithParamInterface<double> {};

TEST_P(ShortLibrary, isNamedAndEndsNothing) {
    const auto whole = static_cast<double>(std::filesystem::file_size(library_));
    std::filesystem::resize_file(library_, static_cast<std::uintmax_t>(whole * GetParam()));
    EXPECT_THAT(page(), HasSubstr("Broken.bundle/libVeloraMusic.so"));
}

INSTANTIATE_TEST_SUITE_P(BrokenPlugin, ShortLibrary,
                         testing::Values(0.0, 0.00001, 0.0005, 0.01, 0.1, 0.3, 0.5, 0.9));

TEST_F(BrokenPlugin, emptyPlaceFallsBackToTheInstalledPlugin) {
    std::filesystem::remove_all(bundle_);
    EXPECT_THAT(page(), HasSubstr("Synced Playlist: None"));
}

TEST_F(BrokenPlugin, commandsGetAHintAndTheAppGoesOn) {
    registerAs("{");
    QuorlProcess quorl({"--text", "--plugins", plugins_.path().string()});
    quorl.say("1");
    quorl.readUntil("There is no row 1. This page has no rows.");
    quorl.say("q");
    EXPECT_EQ(quorl.end(), 0);
}

TEST_F(BrokenPlugin, isPicturedToo) {
    registerAs("{");
    const auto file = (music_.folder() / "shot.png").string();
    QuorlProcess quorl(
        {"--screenshot", file, "--plugins", plugins_.path().string(), "--pane", "limit"});
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_EQ(QImage(QString::fromStdString(file)).size(), QSize(360, 720));
}

} // namespace

} // namespace quorl::tests
