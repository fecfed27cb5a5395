// The list of our files on a wearable, which others may have had in their hands.

#include "services/wearable/Manifest.h"

#include <fstream>
#include <limits>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "services/base/AtomicFile.h"
#include "services/wearable/Attachment.h"
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
    const TemporaryDirectory device;
    const auto root = quorl::base::openRoot(device.path().c_str());

    saveManifest(root.get(), everything());

    EXPECT_EQ(loadManifest(root.get()), everything());
}

TEST(Manifest, IsEmptyOnAWearableThatWasNeverSynced) {
    const TemporaryDirectory device;

    EXPECT_EQ(loadManifest(quorl::base::openRoot(device.path().c_str()).get()), Manifest{});
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
            EXPECT_THAT(error.what(), HasSubstr("Remove the file .quorl/manifest.json"));
        }
    }
}

/// Why the manifest of `device` is rejected.
std::string rejectionOf(const TemporaryDirectory& device) {
    try {
        static_cast<void>(loadManifest(quorl::base::openRoot(device.path().c_str()).get()));
    } catch (const BadManifest& error) {
        return error.what();
    }
    return {};
}

TEST(Manifest, ThatIsNoFileIsRejectedAndNotWaitedFor) {
    const TemporaryDirectory device;
    const auto manifest = device.path() / ".quorl/manifest.json";
    std::filesystem::create_directory(device.path() / ".quorl");
    ASSERT_EQ(mkfifo(manifest.c_str(), 0644), 0);
    EXPECT_THAT(rejectionOf(device), HasSubstr("not a regular file"));

    std::filesystem::remove(manifest);
    std::filesystem::create_directory(manifest);
    EXPECT_THAT(rejectionOf(device), HasSubstr("not a regular file"));

    std::filesystem::remove(manifest);
    std::filesystem::create_symlink("/dev/zero", manifest);
    EXPECT_THAT(rejectionOf(device), HasSubstr("not a regular file"));
}

TEST(Manifest, OfAGigabyteIsRejectedUnread) {
    const TemporaryDirectory device;
    std::filesystem::create_directory(device.path() / ".quorl");
    const auto manifest = device.path() / ".quorl/manifest.json";
    std::ofstream{manifest}.close();
    std::filesystem::resize_file(manifest, std::uintmax_t{1} << 30);

    EXPECT_THAT(rejectionOf(device), HasSubstr("larger than 64 MiB"));
}

TEST(Manifest, IsWrittenPastAPipeThatLiesInTheWay) {
    const TemporaryDirectory device;
    std::filesystem::create_directory(device.path() / ".quorl");
    ASSERT_EQ(mkfifo((device.path() / ".quorl/.manifest.json.new").c_str(), 0644), 0);
    const auto root = quorl::base::openRoot(device.path().c_str());

    saveManifest(root.get(), everything());

    EXPECT_EQ(loadManifest(root.get()), everything());
}

TEST(Manifest, KeepsTheEarliestAndTheLatestTime) {
    auto manifest = everything();
    manifest.strays.front().modified = std::numeric_limits<std::int64_t>::min();
    manifest.songs.front().modified = std::numeric_limits<std::int64_t>::max();

    EXPECT_EQ(parseManifest(toText(manifest)), manifest);
}

TEST(Manifest, IsNotWrittenThroughALinkThatLeadsOffTheWearable) {
    const TemporaryDirectory device;
    const TemporaryDirectory elsewhere;
    std::filesystem::create_directory_symlink(elsewhere.path(), device.path() / ".quorl");

    EXPECT_THROW(saveManifest(quorl::base::openRoot(device.path().c_str()).get(), everything()),
                 std::system_error);

    EXPECT_TRUE(std::filesystem::is_empty(elsewhere.path()));
}

TEST(Attachment, IsConnectedAndOnTheChargerUntilTheUserSaysOtherwise) {
    const TemporaryDirectory device;
    const auto root = quorl::base::openRoot(device.path().c_str());
    EXPECT_EQ(loadAttachment(root.get()), (Attachment{true, true}));

    saveAttachment(root.get(), {true, false});

    EXPECT_EQ(loadAttachment(root.get()), (Attachment{true, false}));
}

} // namespace
