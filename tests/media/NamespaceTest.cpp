// These tests mount file systems and lower limits of the system. They run in namespaces of their
// own, which CMakeLists.txt sees to, so that nothing outside notices.

#include <cerrno>
#include <fstream>
#include <stdexcept>
#include <string>
#include <system_error>

#include <gtest/gtest.h>
#include <sys/mount.h>

#include "tests/base/TemporaryDirectory.h"
#include "tests/media/WatchedFolder.h"

namespace quorl::media::test {

using tests::TemporaryDirectory;

namespace {

/// A file system in memory at a directory, for as long as it lives.
class Mount {
  public:
    explicit Mount(std::filesystem::path place) : place_(std::move(place)) {
        if (mount("none", place_.c_str(), "tmpfs", 0, nullptr) != 0) {
            throw std::system_error(errno, std::generic_category(), "mount");
        }
    }

    ~Mount() { unmount(); }

    Mount(const Mount&) = delete;
    Mount& operator=(const Mount&) = delete;

    /// Gives 0, or the error.
    int unmount() const { return umount(place_.c_str()) == 0 ? 0 : errno; }

  private:
    std::filesystem::path place_;
};

/// A limit of this user namespace, put back in the end.
class Limit {
  public:
    explicit Limit(const std::string& name) : path_("/proc/sys/user/" + name) {
        std::ifstream(path_) >> before_;
    }

    ~Limit() { write(before_); }

    Limit(const Limit&) = delete;
    Limit& operator=(const Limit&) = delete;

    void set(int value) const {
        if (!write(std::to_string(value))) {
            throw std::runtime_error("The limit " + path_ + " cannot be set.");
        }
    }

  private:
    bool write(const std::string& value) const {
        return static_cast<bool>(std::ofstream(path_) << value << std::flush);
    }

    std::string path_;
    std::string before_;
};

} // namespace

TEST(MountTest, ADiskThatIsMountedAtTheFolderIsReadAndWatchedAndCanBeUnmounted) {
    const TemporaryDirectory folder;
    folder.write("Music/Inside.m3u", "");
    WatchedFolder watched(folder / "Music");
    watched.waitForSongs("Inside.m3u", 0);

    const Mount disk(folder / "Music");
    watched.waitFor([](const Inventory& each) { return each.playlists.empty(); });

    folder.writeSongs({"Music/one.mp3"});
    folder.write("Music/Disk.m3u", "one.mp3\n");
    watched.waitForSongs("Disk.m3u", 1);

    // Held, so that no file is open because of a reading that happens to go on.
    watched.holdNextCall();
    folder.write("Music/Another.m3u", "");
    watched.waitUntilHeld();
    EXPECT_EQ(disk.unmount(), 0);
    watched.release();
    watched.waitForSongs("Inside.m3u", 0);

    folder.write("Music/Newer.m3u", "");
    watched.waitForSongs("Newer.m3u", 0);
}

TEST(MountTest, ADiskThatIsMountedOnTheWayToTheFolderIsNoticed) {
    const TemporaryDirectory folder;
    folder.makeDirectory("disk with space");
    folder.link("Music", "disk with space/Music");
    WatchedFolder watched(folder / "Music");
    watched.waitFor([](const Inventory& each) { return !each.rootFound; });

    folder.makeDirectory("prepared");
    const Mount disk(folder / "prepared");
    folder.write("prepared/Music/List.m3u", "");
    const std::filesystem::path prepared = folder / "prepared";
    const std::filesystem::path place = folder / "disk with space";
    ASSERT_EQ(mount(prepared.c_str(), place.c_str(), nullptr, MS_BIND, nullptr), 0);
    watched.waitForSongs("List.m3u", 0);

    EXPECT_EQ(umount(place.c_str()), 0);
    watched.waitFor([](const Inventory& each) { return !each.rootFound; });
}

TEST(MountTest, ADiskThatIsMountedInTheFolderIsPartOfIt) {
    const TemporaryDirectory folder;
    folder.makeDirectory("Music/my disk");
    WatchedFolder watched(folder / "Music");
    folder.makeDirectory("prepared");
    const Mount disk(folder / "prepared");
    folder.write("prepared/List.m3u", "");
    const std::filesystem::path prepared = folder / "prepared";
    const std::filesystem::path place = folder / "Music/my disk";

    ASSERT_EQ(mount(prepared.c_str(), place.c_str(), nullptr, MS_BIND, nullptr), 0);
    watched.waitForSongs("my disk/List.m3u", 0);

    EXPECT_EQ(umount(place.c_str()), 0);
    watched.waitFor([](const Inventory& each) { return each.playlists.empty(); });
}

TEST(LimitTest, DirectoriesThatCannotBeWatchedAreCountedAndReadByARescan) {
    const TemporaryDirectory folder;
    for (int directory = 0; directory < 20; ++directory) {
        folder.makeDirectory("directory " + std::to_string(directory));
    }
    folder.makeDirectory("z/last");
    const Limit limit("max_inotify_watches");
    limit.set(10);

    WatchedFolder watched(folder.path());
    const auto first = watched.waitFor([](const Inventory&) { return true; });
    EXPECT_GE(first->unwatchedDirectories, 13U);
    EXPECT_NE(
        first->unwatchedNotice().find(std::to_string(first->unwatchedDirectories) + " directories"),
        std::string::npos);
    EXPECT_NE(first->unwatchedNotice().find("fs.inotify.max_user_watches"), std::string::npos);

    folder.write("z/last/List.m3u", "");
    watched.rescan();
    watched.waitForSongs("z/last/List.m3u", 0);

    limit.set(1000);
    watched.rescan();
    const auto all =
        watched.waitFor([](const Inventory& each) { return each.unwatchedDirectories == 0; });
    EXPECT_EQ(all->unwatchedNotice(), "");

    folder.write("z/last/Other.m3u", "");
    watched.waitForSongs("z/last/Other.m3u", 0);
}

TEST(LimitTest, WithoutAnyWatchTheFolderIsStillRead) {
    const TemporaryDirectory folder;
    folder.write("List.m3u", "");
    const Limit limit("max_inotify_instances");
    limit.set(0);

    WatchedFolder watched(folder.path());

    const auto first = watched.waitForSongs("List.m3u", 0);
    EXPECT_EQ(first->unwatchedDirectories, 1U);
    EXPECT_NE(first->unwatchedNotice().find("1 directory "), std::string::npos);
    folder.write("Other.m3u", "");
    watched.rescan();
    watched.waitForSongs("Other.m3u", 0);
}

} // namespace quorl::media::test
