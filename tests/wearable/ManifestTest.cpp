// The list of our files on a wearable, which others may have had in their hands.

#include "services/wearable/Manifest.h"

#include <limits>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "services/base/AtomicFile.h"
#include "services/wearable/Attachment.h"
#include "services/wearable/Wearable.h"
#include "tests/base/TemporaryDirectory.h"

namespace {

using namespace quorl::wearable;
using quorl::tests::TemporaryDirectory;
using ::testing::HasSubstr;

Manifest everything() {
    constexpr auto most = std::numeric_limits<std::uint64_t>::max();
    return {{{"Añjo.mp3", "Dir/100%\xFF\x01 Añjo.mp3", most, -1, "abc"}},
            Entry{"List.m3u8", "List.m3u", 7, 0, "def"},
            {{"old.ogg", "old.ogg", 0, 1, ""}},
            Selection{most, most - 1, 2, 3}};
}

TEST(Manifest, GivesBackWhatWasWritten) {
    EXPECT_EQ(parseManifest(toText(everything())), everything());
}

class HostileManifest : public ::testing::TestWithParam<std::string> {};

TEST_P(HostileManifest, IsRejectedBecauseAFileElsewhereCouldBeRemovedByItsName) {
    auto manifest = everything();
    manifest.strays.front().name = GetParam();

    EXPECT_THROW(static_cast<void>(parseManifest(toText(manifest))), BadManifest);
}

INSTANTIATE_TEST_SUITE_P(Name, HostileManifest,
                         ::testing::Values("", ".", "..", "../state.json", "/etc/passwd", "a/b",
                                           std::string("a\0b", 3)));

TEST(Manifest, ThatIsBrokenSaysWhatToDo) {
    for (const auto* text : {"{", "[]", "{\"format\":2}", "{\"format\":1,\"songs\":3}"}) {
        try {
            static_cast<void>(parseManifest(text));
            FAIL() << text;
        } catch (const BadManifest& error) {
            EXPECT_THAT(error.what(), HasSubstr("Remove the files .quorl/manifest.*"));
        }
    }
}

TEST(Manifest, WithNumbersThatWeHaveNeverWrittenIsRejected) {
    const std::string text = toText(everything());
    for (const std::string number :
         {"-1", "0.5", "18446744073709551616", "1e300", "\"7\"", "null"}) {
        auto changed = text;
        const std::string field = "\"size\": 7";
        changed.replace(changed.find(field), field.size(), "\"size\": " + number);
        EXPECT_THROW(static_cast<void>(parseManifest(changed)), BadManifest) << number;
    }
    auto late = text;
    const std::string field = "\"modified\": -1";
    late.replace(late.find(field), field.size(), "\"modified\": 9223372036854775808");
    EXPECT_THROW(static_cast<void>(parseManifest(late)), BadManifest);
}

TEST(Manifest, ThatIsNestedAsDeeplyAsItIsLongIsReadNoFurtherThanItsFirstLevels) {
    const std::string text = R"({"format":1,"strays":[],"songs":)" + std::string(1'000'000, '[');
    try {
        static_cast<void>(parseManifest(text));
        FAIL();
    } catch (const BadManifest& error) {
        EXPECT_THAT(error.what(), HasSubstr("nested too deeply"));
    }
}

TEST(Manifest, KeepsTheEarliestAndTheLatestTime) {
    auto manifest = everything();
    manifest.strays.front().modified = std::numeric_limits<std::int64_t>::min();
    manifest.songs.front().modified = std::numeric_limits<std::int64_t>::max();

    EXPECT_EQ(parseManifest(toText(manifest)), manifest);
}

TEST(Attachment, IsConnectedAndOnTheChargerUntilTheUserSaysOtherwise) {
    const TemporaryDirectory device;
    const auto root = quorl::base::openRoot(device.path().c_str());
    EXPECT_EQ(loadAttachment(root.get()), (Attachment{true, true}));

    saveAttachment(root.get(), {true, false});

    EXPECT_EQ(loadAttachment(root.get()), (Attachment{true, false}));
}

TEST(Attachment, ThatWouldFillTheMemoryIsNotRead) {
    const TemporaryDirectory device;
    const auto root = quorl::base::openRoot(device.path().c_str());
    saveAttachment(root.get(), {false, false});
    const auto file = std::filesystem::path(ownDirectory) / "state.json";

    device.write(file.native(),
                 std::string(5000, ' ') + R"({"connected":false,"onCharger":false})");
    EXPECT_EQ(loadAttachment(root.get()), (Attachment{true, true}));

    std::filesystem::resize_file(device.path() / file, std::uintmax_t{1} << 40);

    EXPECT_EQ(loadAttachment(root.get()), (Attachment{true, true}));
}

} // namespace
