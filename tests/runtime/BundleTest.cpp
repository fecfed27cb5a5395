#include <algorithm>
#include <cstddef>
#include <fstream>
#include <functional>
#include <random>

#include <gmock/gmock.h>
#include <link.h>
#include <nlohmann/json.hpp>
#include <sys/resource.h>
#include <sys/stat.h>

#include "platform/InterfaceVersion.h"
#include "runtime/plugins/BundleFiles.h"
#include "runtime/plugins/PluginBundle.h"
#include "runtime/plugins/SharedObjectFile.h"
#include "tests/base/ManualPage.h"
#include "tests/base/TemporaryDirectory.h"
#include "tests/runtime/Digests.h"
#include "tests/support/Damage.h"
#include "tests/support/TestHost.h"

namespace {

using quorl::BundleError;
using quorl::PluginBundle;
using quorl::tests::bytesOf;
using quorl::tests::TemporaryDirectory;
using quorl::tests::TestHost;
using std::filesystem::path;
using testing::ContainsRegex;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

const path builtPlugin = TEST_PLUGIN;
const path builtTexts = TEST_TEXTS;

/// Makes the file anew: replaced contents, which some file systems bring to the disk at once, take
/// much longer.
void write(const path& file, const std::string& content) {
    std::filesystem::remove(file);
    std::ofstream(file, std::ios::binary) << content;
}

class OfThisProgram : public NSObject {};

class AlsoOfThisProgram : public NSObject {};

class Bundles : public testing::Test {
  protected:
    /// A registration in good order, with the digests that the files of the bundle have now, but
    /// for what is replaced in its text.
    [[nodiscard]] std::string registration(const std::string& replaced = {},
                                           const std::string& replacement = {}) const {
        auto digests = quorl::tests::digestsOfTexts(bundle_);
        digests["libTestPlugin.so"] = quorl::sha256(bytesOf(library_));
        std::string text = R"({"identifier": "org.quorl.test", "interfaceVersion": VERSION,)"
                           R"( "library": "libTestPlugin.so", "rootClass": "TestPane",)"
                           R"( "sha256": )" +
                           nlohmann::json(digests).dump() + "}";
        text.replace(text.find("VERSION"), 7, std::to_string(QuorlInterfaceVersion));
        if (!replaced.empty()) {
            text.replace(text.find(replaced), replaced.size(), replacement);
        }
        return text;
    }

    /// A bundle without fault.
    void makeBundle() {
        std::filesystem::create_directories(bundle_);
        std::filesystem::copy(builtPlugin, library_);
        std::filesystem::copy(builtTexts, bundle_ / "locale",
                              std::filesystem::copy_options::recursive);
        write(registration_, registration());
    }

    /// The problem that an act on a bundle ends with. Fails the test where there is none, and where
    /// it is not about `file`.
    static std::string problemIn(const path& file, const std::function<void()>& act) {
        try {
            act();
        } catch (const BundleError& error) {
            EXPECT_EQ(error.file(), file);
            EXPECT_THAT(error.what(), StartsWith(file.string() + ": "));
            EXPECT_THAT(
                error.what(),
                ContainsRegex("(install the plug-in (again|for this one|and the app from one "
                              "release)|check its permissions)$"));
            return error.what();
        }
        ADD_FAILURE() << "no problem was found";
        return {};
    }

    [[nodiscard]] std::string problemOfRegistration(const std::string& text) const {
        write(registration_, text);
        return problemIn(registration_, [this] { (void)PluginBundle::open(bundle_); });
    }

    /// Of `bytes` in the place of the shared object, with which the plug-in was made.
    [[nodiscard]] std::string problemOfLibrary(const std::string& bytes) const {
        write(library_, bytes);
        write(registration_, registration());
        return problemOfLibrary();
    }

    [[nodiscard]] std::string problemOfLibrary() const {
        const auto opened = PluginBundle::open(bundle_);
        return problemIn(library_, [&opened] { (void)opened->rootClass(); });
    }

    TemporaryDirectory directory_;
    const path bundle_ = directory_.path() / "Test.bundle";
    const path registration_ = bundle_ / "registration.json";
    const path library_ = bundle_ / "libTestPlugin.so";
    std::shared_ptr<TestHost> host_ = TestHost::installed();
};

TEST_F(Bundles, SayWhatTheyAreBeforeTheirCodeIsLoaded) {
    makeBundle();
    std::filesystem::remove(library_);

    const auto opened = PluginBundle::open(bundle_);

    EXPECT_EQ(opened->directory(), bundle_);
    EXPECT_EQ(opened->bundleIdentifier(), "org.quorl.test");
    EXPECT_EQ(opened->registration().rootClass, "TestPane");
    EXPECT_EQ(opened->registration().library, "libTestPlugin.so");
    EXPECT_EQ(opened->registration().interfaceVersion, QuorlInterfaceVersion);
}

TEST_F(Bundles, AreRegisteredAsTheManualShows) {
    std::filesystem::create_directories(bundle_);
    const auto example = nlohmann::json::parse(quorl::tests::exampleIn("quorl-registration.5"));
    write(registration_, example.dump());

    const auto registered = PluginBundle::open(bundle_)->registration();
    EXPECT_EQ(registered.identifier, example.at("identifier"));
    EXPECT_EQ(registered.rootClass, example.at("rootClass"));
    EXPECT_EQ(registered.library, example.at("library"));
    EXPECT_EQ(registered.digests, example.at("sha256"));
    for (const auto& [field, value] : example.items()) {
        auto rest = example;
        rest.erase(field);
        EXPECT_THAT(problemOfRegistration(rest.dump()), HasSubstr('"' + field + '"'));
    }
}

TEST_F(Bundles, GiveTheClassOfTheirRootPane) {
    makeBundle();

    const Class root = PluginBundle::open(bundle_)->rootClass();
    const auto pane = std::dynamic_pointer_cast<QPSNotificationAppController>(root.create());

    EXPECT_EQ(root.name(), "TestPane");
    ASSERT_NE(pane, nullptr);
    EXPECT_EQ(pane->title(), "A title from the table");
}

TEST_F(Bundles, GiveTheSameClassAtEachCall) {
    makeBundle();
    const auto opened = PluginBundle::open(bundle_);

    EXPECT_TRUE(opened->rootClass() == opened->rootClass());
}

TEST_F(Bundles, AreFoundAgainFromTheClassesOfTheirCode) {
    makeBundle();
    const auto pane = PluginBundle::open(bundle_)->rootClass().create();

    const auto found = NSBundle::bundleForClass(Class::ofObject(*pane));

    EXPECT_EQ(found->bundleIdentifier(), "org.quorl.test");
    EXPECT_EQ(NSBundle::bundleForClass(Class::ofObject(*pane)), found);
}

TEST_F(Bundles, OfTheProgramAndThePlatformHaveNoIdentifierAndNoTexts) {
    for (const Class& cls : {Class::of<OfThisProgram>(), Class::of<NSObject>()}) {
        const auto own = NSBundle::bundleForClass(cls);

        EXPECT_EQ(own->bundleIdentifier(), std::nullopt);
        EXPECT_EQ(own->localizedStringForKey_value_table("KEY", "value", std::nullopt), "value");
        EXPECT_EQ(own->localizedStringForKey_value_table("KEY", "", std::nullopt), "KEY");
        EXPECT_EQ(own->localizedStringForKey_value_table("KEY", std::nullopt, "table"), "KEY");
    }
}

TEST_F(Bundles, AreOneForAllClassesThatStandTogether) {
    EXPECT_EQ(NSBundle::bundleForClass(Class::of<OfThisProgram>()),
              NSBundle::bundleForClass(Class::of<AlsoOfThisProgram>()));
}

TEST_F(Bundles, LookATextUpInTheirTableThenTakeTheValueThenTheKey) {
    makeBundle();
    const auto opened = PluginBundle::open(bundle_);

    EXPECT_EQ(opened->localizedStringForKey_value_table("TITLE", "value", std::nullopt),
              "A title from the table");
    EXPECT_EQ(opened->localizedStringForKey_value_table("MISSING", "value", std::nullopt), "value");
    EXPECT_EQ(opened->localizedStringForKey_value_table("MISSING", "", std::nullopt), "MISSING");
    EXPECT_EQ(opened->localizedStringForKey_value_table("MISSING", std::nullopt, std::nullopt),
              "MISSING");
}

TEST_F(Bundles, LookATextUpInAnotherTableWhereOneIsNamed) {
    makeBundle();
    const auto opened = PluginBundle::open(bundle_);

    EXPECT_EQ(opened->localizedStringForKey_value_table("TITLE", "value", "other"),
              "A title from the other table");
    EXPECT_EQ(opened->localizedStringForKey_value_table("TITLE", "value", "absent"), "value");
}

TEST_F(Bundles, WithoutARegistrationAreRefused) {
    std::filesystem::create_directories(bundle_);

    EXPECT_THAT(problemIn(registration_, [this] { (void)PluginBundle::open(bundle_); }),
                HasSubstr("missing"));
}

TEST_F(Bundles, WhoseRegistrationIsNoJsonObjectAreRefused) {
    makeBundle();

    for (const std::string text :
         {"", "{", "[]", "\"text\"", "null", "{} {}", "\xff\xfe", "{'a': 1}"}) {
        EXPECT_THAT(problemOfRegistration(text), HasSubstr("not a JSON object")) << text;
    }
    EXPECT_THAT(problemOfRegistration(std::string(100'000, '[')), HasSubstr("not a JSON object"));
}

TEST_F(Bundles, WhoseRegistrationIsADirectoryAreRefused) {
    std::filesystem::create_directories(registration_);

    EXPECT_THAT(problemIn(registration_, [this] { (void)PluginBundle::open(bundle_); }),
                HasSubstr("install the plug-in again"));
}

TEST_F(Bundles, WhoseRegistrationIsAPipeOrADeviceAreRefusedAndNotWaitedFor) {
    std::filesystem::create_directories(bundle_);
    const auto open = [this] { (void)PluginBundle::open(bundle_); };
    ASSERT_EQ(mkfifo(registration_.c_str(), 0644), 0);
    EXPECT_THAT(problemIn(registration_, open), HasSubstr("install the plug-in again"));

    std::filesystem::remove(registration_);
    std::filesystem::create_symlink("/dev/zero", registration_);
    EXPECT_THAT(problemIn(registration_, open), HasSubstr("install the plug-in again"));
}

TEST_F(Bundles, WhoseRegistrationIsAGigabyteAreRefusedUnread) {
    makeBundle();
    std::filesystem::resize_file(registration_, std::uintmax_t{1} << 30);

    EXPECT_THAT(problemIn(registration_, [this] { (void)PluginBundle::open(bundle_); }),
                HasSubstr("larger than any of its kind"));

    constexpr std::uintmax_t most = std::uintmax_t{1} << 20;
    std::filesystem::resize_file(registration_, most + 1);
    EXPECT_THAT(problemIn(registration_, [this] { (void)PluginBundle::open(bundle_); }),
                HasSubstr("larger than any of its kind"));
}

TEST_F(Bundles, WhoseLibraryIsLargerThanAnyAreNotLoaded) {
    makeBundle();
    constexpr std::uintmax_t most = std::uintmax_t{256} << 20;
    std::filesystem::resize_file(library_, most + 1);

    EXPECT_THAT(problemOfLibrary(), HasSubstr("larger than any of its kind"));
}

TEST(SharedObjects, ThatAreNotThereOrCannotBeReadSayWhatToDo) {
    const TemporaryDirectory directory;
    const auto missing = "this file is missing; install the plug-in again";
    EXPECT_EQ(quorl::problemOfSharedObject(directory.path() / "gone"), missing);
    EXPECT_EQ(quorl::problemOfSharedObject(directory.path()), missing);
    EXPECT_EQ(quorl::problemOfSharedObject(builtPlugin), std::nullopt);

    rlimit before{};
    getrlimit(RLIMIT_NOFILE, &before);
    const rlimit none{0, before.rlim_max};
    setrlimit(RLIMIT_NOFILE, &none);
    const auto problem = quorl::problemOfSharedObject(builtPlugin);
    setrlimit(RLIMIT_NOFILE, &before);
    EXPECT_EQ(problem, "this file cannot be read; check its permissions");
}

TEST_F(Bundles, WhoseRegistrationWasDamagedAreRefusedOrOpened) {
    makeBundle();
    const std::string whole = registration();
    quorl::tests::Damage damage;

    for (int count = 0; count < 1000; ++count) {
        write(registration_, damage.of(whole));
        try {
            EXPECT_FALSE(PluginBundle::open(bundle_)->registration().rootClass.empty());
        } catch (const BundleError& error) {
            EXPECT_EQ(error.file(), registration_);
        }
    }
}

TEST(Digest, IsThatOfTheStandard) {
    EXPECT_EQ(quorl::sha256(""),
              "e3b0c44298fc1c149afbf4c8996fb92427ae41e4649b934ca495991b7852b855");
    EXPECT_EQ(quorl::sha256("abc"),
              "ba7816bf8f01cfea414140de5dae2223b00361a396177a9cb410ff61f20015ad");
}

TEST_F(Bundles, WhoseRegistrationWasCutShortAreRefusedAtEveryLength) {
    makeBundle();
    const std::string whole = registration();

    for (std::size_t length = 0; length < whole.size(); ++length) {
        EXPECT_THAT(problemOfRegistration(whole.substr(0, length)), HasSubstr("damaged")) << length;
    }
}

TEST_F(Bundles, ThatLackAFieldAreRefusedWithItsName) {
    makeBundle();

    for (const std::string field :
         {"identifier", "interfaceVersion", "library", "rootClass", "sha256"}) {
        EXPECT_THAT(problemOfRegistration(registration('"' + field + '"', "\"other\"")),
                    HasSubstr('"' + field + '"'));
    }
}

TEST_F(Bundles, WithAFieldOfAnotherKindAreRefusedWithItsName) {
    makeBundle();

    EXPECT_THAT(problemOfRegistration(registration("\"TestPane\"", "7")), HasSubstr("rootClass"));
    EXPECT_THAT(problemOfRegistration(registration("\"TestPane\"", "\"\"")),
                HasSubstr("rootClass"));
    EXPECT_THAT(problemOfRegistration(registration("\"org.quorl.test\"", "[]")),
                HasSubstr("identifier"));
    const std::string version = std::to_string(QuorlInterfaceVersion);
    EXPECT_THAT(problemOfRegistration(registration(version, version + ".0")),
                HasSubstr("interfaceVersion"));
    EXPECT_THAT(problemOfRegistration(registration(version, '"' + version + '"')),
                HasSubstr("interfaceVersion"));
}

TEST_F(Bundles, MadeForAnotherVersionAreRefusedWithBothVersions) {
    makeBundle();
    const std::string own = std::to_string(QuorlInterfaceVersion);

    for (const std::string other : {"0", "-1", "4711", "18446744073709551615"}) {
        EXPECT_THAT(problemOfRegistration(registration(own, other)),
                    testing::AllOf(HasSubstr("version " + other), HasSubstr("version " + own)));
    }
}

/// A registration that says its minor version.
std::string withMinorVersion(std::string text, const std::string& minor) {
    const std::string before = "\"interfaceVersion\": ";
    return text.replace(text.find(before), 0, "\"interfaceMinorVersion\": " + minor + ", ");
}

TEST_F(Bundles, OfThisAndOfEachSmallerMinorVersionAreOpened) {
    makeBundle();
    EXPECT_EQ(PluginBundle::open(bundle_)->registration().interfaceMinorVersion, 0)
        << "where nothing is said";

    for (int minor = 0; minor <= QuorlInterfaceMinorVersion; ++minor) {
        write(registration_, withMinorVersion(registration(), std::to_string(minor)));
        EXPECT_EQ(PluginBundle::open(bundle_)->registration().interfaceMinorVersion, minor);
    }
}

TEST_F(Bundles, OfALaterMinorVersionAreRefusedAndTheAppIsToBeUpdated) {
    makeBundle();
    const std::string version = std::to_string(QuorlInterfaceVersion) + ".";
    const std::string own = version + std::to_string(QuorlInterfaceMinorVersion);

    for (const std::string& later :
         {std::to_string(QuorlInterfaceMinorVersion + 1), std::string("18446744073709551615")}) {
        EXPECT_THAT(problemOfRegistration(withMinorVersion(registration(), later)),
                    testing::AllOf(HasSubstr("against version " + version + later),
                                   HasSubstr("has version " + own + "; update the app")));
    }
}

TEST_F(Bundles, OfAMinorVersionThatIsNoneAreRefused) {
    makeBundle();

    for (const std::string none : {"\"1\"", "0.5", "null", "[]"}) {
        EXPECT_THAT(problemOfRegistration(withMinorVersion(registration(), none)),
                    HasSubstr("\"interfaceMinorVersion\""));
    }
    EXPECT_THAT(problemOfRegistration(withMinorVersion(registration(), "-1")),
                HasSubstr("version " + std::to_string(QuorlInterfaceVersion) + ".-1"));
}

TEST_F(Bundles, OfAnotherVersionSayWhichOfBothIsToBeUpdated) {
    makeBundle();
    const std::string own = std::to_string(QuorlInterfaceVersion);
    const std::string earlier = std::to_string(QuorlInterfaceVersion - 1);
    const std::string later = std::to_string(QuorlInterfaceVersion + 1);

    EXPECT_THAT(problemOfRegistration(registration(own, earlier)), HasSubstr("update the plug-in"));
    EXPECT_THAT(problemOfRegistration(registration(own, later)), HasSubstr("update the app"));
    EXPECT_THAT(problemOfRegistration(withMinorVersion(registration(own, earlier), "99")),
                HasSubstr("update the plug-in"));
}

TEST_F(Bundles, WhoseLibraryIsNotTheirsAreRefused) {
    makeBundle();

    for (const std::string name : {"../libTestPlugin.so", "/usr/lib/libc.so.6", "a/b.so"}) {
        EXPECT_THAT(problemOfRegistration(registration("libTestPlugin.so", name)),
                    HasSubstr("a file of the bundle itself"));
    }
}

TEST_F(Bundles, WithoutTheirLibraryAreNotLoaded) {
    makeBundle();
    std::filesystem::remove(library_);
    EXPECT_THAT(problemOfLibrary(), HasSubstr("missing"));

    std::filesystem::create_directory(library_);
    EXPECT_THAT(problemOfLibrary(), HasSubstr("missing"));

    std::filesystem::remove(library_);
    ASSERT_EQ(mkfifo(library_.c_str(), 0644), 0);
    EXPECT_THAT(problemOfLibrary(), HasSubstr("missing"));
}

TEST_F(Bundles, WhoseLibraryWasCutShortAreNotLoadedAtAnyLength) {
    makeBundle();
    const std::string whole = bytesOf(builtPlugin);
    std::vector<std::size_t> lengths{0, 1, 4, 16, 63, 64, 65, whole.size() / 2, whole.size() - 1};
    for (std::size_t length = 100; length < whole.size(); length += whole.size() / 50) {
        lengths.push_back(length);
    }

    for (const std::size_t length : lengths) {
        EXPECT_THAT(problemOfLibrary(whole.substr(0, length)), HasSubstr("damaged")) << length;
    }
}

/// What stands at this place of a file's content.
template <class T>
T valueAt(const std::string& content, std::size_t place) {
    T value;
    content.copy(reinterpret_cast<char*>(&value), sizeof value, place);
    return value;
}

TEST_F(Bundles, WhoseLibraryNamesMoreThanItHoldsAreNotLoaded) {
    makeBundle();
    const std::string whole = bytesOf(builtPlugin);
    const auto place = valueAt<ElfW(Ehdr)>(whole, 0).e_phoff;
    const auto with = [&](const ElfW(Phdr) & segment) {
        std::string changed = whole;
        return changed.replace(place, sizeof segment, reinterpret_cast<const char*>(&segment),
                               sizeof segment);
    };
    for (const auto field : {&ElfW(Phdr)::p_offset, &ElfW(Phdr)::p_filesz}) {
        auto segment = valueAt<ElfW(Phdr)>(whole, place);
        segment.*field = static_cast<ElfW(Off)>(whole.size() + 1);
        EXPECT_THAT(problemOfLibrary(with(segment)), HasSubstr("its end is missing"));
    }
    auto last = valueAt<ElfW(Phdr)>(whole, place);
    last.p_offset = static_cast<ElfW(Off)>(whole.size() - 1);
    last.p_filesz = 2;
    EXPECT_THAT(problemOfLibrary(with(last)), HasSubstr("its end is missing"));
}

TEST_F(Bundles, WhoseLibraryHasNoSegmentsAreNotLoaded) {
    makeBundle();
    std::string bytes = bytesOf(builtPlugin);
    bytes.replace(offsetof(ElfW(Ehdr), e_phnum), sizeof(ElfW(Half)), sizeof(ElfW(Half)), '\0');

    EXPECT_THAT(problemOfLibrary(bytes), HasSubstr("its end is missing"));
}

TEST_F(Bundles, WhoseFilesAreLargerThanAnyAreRefusedUnread) {
    constexpr std::size_t most = 1000;
    const auto file = directory_.path() / "file";
    write(file, std::string(most, 'x'));
    EXPECT_EQ(quorl::readBundleFile(file, most), std::string(most, 'x'));
    EXPECT_THAT(problemIn(file, [&] { (void)quorl::readBundleFile(file, most - 1); }),
                HasSubstr("larger than any of its kind"));
}

TEST_F(Bundles, WhoseLibraryIsSomethingElseAreNotLoaded) {
    makeBundle();
    std::mt19937 numbers; // the same garbage in each run
    std::string garbage(10'000, '\0');
    std::generate(garbage.begin(), garbage.end(), [&] { return static_cast<char>(numbers()); });

    for (const std::string& content : {garbage, std::string("#!/bin/sh\n"),
                                       std::string("\x7f"
                                                   "ELF"),
                                       "\x7f"
                                       "ELF" +
                                           garbage}) {
        EXPECT_THAT(problemOfLibrary(content), HasSubstr("install the plug-in"));
    }
    EXPECT_THAT(problemOfLibrary(bytesOf("/proc/self/exe")),
                HasSubstr("install the plug-in again"));
}

TEST_F(Bundles, WhoseLibraryWasDamagedAreNotLoadedWhateverTheDamage) {
    makeBundle();
    const std::string whole = bytesOf(builtPlugin);
    const auto opened = PluginBundle::open(bundle_);
    quorl::tests::Damage damage;

    for (int count = 0; count < 1000; ++count) {
        write(library_, damage.of(whole));
        ASSERT_THAT(problemIn(library_, [&opened] { (void)opened->rootClass(); }),
                    HasSubstr("not the one that the plug-in was made with; install the plug-in"))
            << count;
    }
}

TEST_F(Bundles, WhoseLibraryWasNeverRecordedAreNotLoaded) {
    makeBundle();
    write(registration_, registration("\"libTestPlugin.so\":", "\"other.so\":"));

    EXPECT_THAT(problemOfLibrary(), HasSubstr("not the one"));
}

TEST_F(Bundles, ForAnotherKindOfMachineAreNotLoaded) {
    makeBundle();
    std::string foreign = bytesOf(builtPlugin);
    foreign[offsetof(ElfW(Ehdr), e_machine)] = EM_68K;

    EXPECT_THAT(problemOfLibrary(foreign), HasSubstr("another kind of machine"));
}

TEST_F(Bundles, WithoutTheClassThatTheyNameAreNotLoaded) {
    makeBundle();
    write(registration_, registration("TestPane", "OtherPane"));

    EXPECT_THAT(problemOfLibrary(), HasSubstr("\"OtherPane\""));
}

TEST_F(Bundles, LoadAfterTheirLibraryWasMended) {
    makeBundle();
    write(library_, "damaged");
    const auto opened = PluginBundle::open(bundle_);
    EXPECT_THROW((void)opened->rootClass(), BundleError);

    std::filesystem::copy(builtPlugin, library_, std::filesystem::copy_options::overwrite_existing);

    EXPECT_EQ(opened->rootClass().name(), "TestPane");
}

TEST_F(Bundles, OfferTheSymbolsOfTheirLoadedCode) {
    makeBundle();
    const auto opened = PluginBundle::open(bundle_);

    EXPECT_EQ(opened->symbol("QuorlClass_TestPane"), nullptr) << "nothing is loaded yet";
    const Class root = opened->rootClass();
    EXPECT_TRUE(*static_cast<const Class*>(opened->symbol("QuorlClass_TestPane")) == root);
    EXPECT_EQ(opened->symbol("QuorlClass_OtherPane"), nullptr);
}

TEST_F(Bundles, AreLookedForWhereOneIsToldThenBesideTheProgramThenInTheHomeDirectory) {
    const path beside =
        std::filesystem::read_symlink("/proc/self/exe").parent_path().parent_path() /
        "lib/quorl/plugins";
    const path home = path(std::getenv("HOME")) / ".local/lib/quorl/plugins";

    const auto told = quorl::pluginDirectories("/told");
    EXPECT_EQ(told.front(), "/told");
    EXPECT_EQ(told.at(1), beside);
    EXPECT_EQ(told.back(), home);
    EXPECT_EQ(quorl::pluginDirectories("").front(), beside);
    EXPECT_EQ(quorl::pluginDirectories(beside), quorl::pluginDirectories("")) << "each once";
}

TEST_F(Bundles, AreFoundByDirectoryThenByName) {
    const path first = directory_.path() / "first";
    const path second = directory_.path() / "second";
    for (const path& made : {second / "A.bundle", second / "B.bundle", first / "Z.bundle",
                             first / "Y.bundle", first / "no bundle"}) {
        std::filesystem::create_directories(made);
    }
    write(first / "A file.bundle", "");

    EXPECT_THAT(quorl::findBundles({first, directory_.path() / "absent", second}),
                ElementsAre(first / "Y.bundle", first / "Z.bundle", second / "A.bundle",
                            second / "B.bundle"));
    EXPECT_THAT(quorl::findBundles({}), IsEmpty());
}

} // namespace
