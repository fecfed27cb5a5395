// How much room a wearable says it has.

#include "services/wearable/Usage.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/mount.h>
#include <sys/statvfs.h>

#include "services/wearable/ContentHash.h"
#include "services/wearable/Generations.h"
#include "tests/base/TemporaryDirectory.h"

namespace {

using namespace quorl::wearable;
using quorl::tests::TemporaryDirectory;

TEST(Usage, OfTheEmbeddedWearableCountsWhatIsUsedAgainstItsCapacity) {
    const TemporaryDirectory device;
    device.write("Music/Somebody else's.mp3", std::string(300, 'x'));
    const Wearable wearable{device.path(), 1000, false};

    const auto answer = readUsage(wearable);

    EXPECT_EQ(answer.capacity, 1000);
    EXPECT_EQ(answer.available, 700);
    EXPECT_EQ(answer.songs, 0) << "the song is not ours";
    EXPECT_FALSE(answer.sent);
}

TEST(Usage, HasNothingAvailableWhenMoreIsUsedThanTheCapacity) {
    const TemporaryDirectory device;
    device.write("big", std::string(2000, 'x'));

    EXPECT_EQ(readUsage({device.path(), 1000, false}).available, 0);
}

TEST(Usage, NeverPromisesMoreThanTheFileSystemHas) {
    const TemporaryDirectory device;

    struct statvfs status {};

    ASSERT_EQ(statvfs(device.path().c_str(), &status), 0);

    const auto answer = readUsage({device.path(), std::uint64_t{1} << 62, false});

    EXPECT_LE(answer.available, status.f_blocks * status.f_frsize);
}

/// Two songs of ours and a playlist were sent to it.
class SentTo : public ::testing::Test {
  protected:
    SentTo() {
        device_.write("Music/a.mp3", std::string(100, 'x'));
        device_.write("Music/b.mp3", std::string(200, 'x'));
        device_.write("Music/List.m3u8", "a list");
        device_.write("Music/foreign.mp3", std::string(50, 'x'));
        device_.write(
            ".quorl/manifest.1",
            generationText(1, {.songs = {{"a.mp3", "a", 100, 0, {}}, {"b.mp3", "b", 200, 0, {}}},
                               .playlist = Entry{"List.m3u8", "List", 6, 0, hashOf("a list")},
                               .strays = {},
                               .sent = sent_}));
    }

    [[nodiscard]] Usage usage() const { return readUsage({device_.path(), {}, false}); }

    const Selection sent_{1, 2, 3, 4};
    const TemporaryDirectory device_;
};

TEST_F(SentTo, CountsTheSongsThatWeHavePutThereAndSaysWhatWasSent) {
    EXPECT_EQ(usage().songs, 300);
    EXPECT_EQ(usage().songCount, 2);
    EXPECT_EQ(usage().sent, sent_);
}

TEST_F(SentTo, DoesNotSayThatAllWasSentOnceASongIsGone) {
    device_.remove("Music/b.mp3");

    EXPECT_EQ(usage().songs, 100);
    EXPECT_EQ(usage().sent, std::nullopt);
}

TEST_F(SentTo, DoesNotSayThatAllWasSentOnceASongIsCutOff) {
    device_.write("Music/b.mp3", "x");

    EXPECT_EQ(usage().sent, std::nullopt);
}

TEST_F(SentTo, DoesNotSayThatAllWasSentOnceThePlaylistIsGone) {
    device_.remove("Music/List.m3u8");

    EXPECT_EQ(usage().sent, std::nullopt);
}

TEST_F(SentTo, DoesNotSayThatAllWasSentOnceSomebodyElsesPlaylistIsInItsPlace) {
    device_.write("Music/List.m3u8", "theirs");

    EXPECT_EQ(usage().sent, std::nullopt);
}

TEST(Usage, OfAWearableThatIsGoneIsAnErrorInWords) {
    const TemporaryDirectory parent;

    try {
        static_cast<void>(readUsage({parent.path() / "gone", {}, false}));
        FAIL();
    } catch (const std::runtime_error& error) {
        EXPECT_THAT(error.what(), ::testing::HasSubstr("cannot be reached"));
    }
}

TEST(Usage, OfTheEmbeddedWearableMakesItOnFirstUse) {
    const TemporaryDirectory parent;
    const Wearable wearable{parent.path() / "not/yet", 10, false};

    EXPECT_EQ(readUsage(wearable).available, 10);
}

TEST(Usage, OfAMountedDeviceIsThatOfItsOwnFileSystemAndNotOfTheDirectoryBeneath) {
    const TemporaryDirectory device;
    if (mount("tmpfs", device.path().c_str(), "tmpfs", 0, "size=1m") != 0) {
        GTEST_SKIP() << "only root may mount";
    }
    const Wearable wearable{device.path(), {}, isMountPoint(device.path())};
    ASSERT_TRUE(wearable.isMountPoint);

    EXPECT_EQ(readUsage(wearable).capacity, 1 << 20);
    EXPECT_LE(readUsage(wearable).available, 1 << 20);

    ASSERT_EQ(umount(device.path().c_str()), 0);
    EXPECT_THROW(static_cast<void>(readUsage(wearable)), std::runtime_error);
}

TEST(Wearable, EmbeddedInThisMachineIsInTheUsersDataDirectory) {
    const TemporaryDirectory data;
    setenv("XDG_DATA_HOME", data.path().c_str(), 1);

    EXPECT_EQ(Wearable::embedded().root, data.path() / "quorl/wearable");
    EXPECT_EQ(Wearable::embedded().capacity, 4'294'967'296);

    unsetenv("XDG_DATA_HOME");
    setenv("HOME", data.path().c_str(), 1);
    EXPECT_EQ(Wearable::embedded().root, data.path() / ".local/share/quorl/wearable");
}

} // namespace
