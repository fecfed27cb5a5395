// The wearable that was chosen is known again by its drive. Runs in namespaces of its own, which
// CMakeLists.txt sees to.

#include <cerrno>
#include <cstdlib>
#include <system_error>

#include <sys/mount.h>
#include <sys/stat.h>

#include "tests/engine/EngineFixture.h"
#include "tests/finding/DiskServiceDouble.h"

namespace {

using namespace quorl;
using namespace quorl::syncd::testing;

class ChosenDrive : public EngineTest {
  protected:
    ChosenDrive() {
        setenv("DBUS_SYSTEM_BUS_ADDRESS", disks_.address().c_str(), 1);
        folder_.makeDirectory("a");
        folder_.makeDirectory("b");
        music_.write("1.mp3", "a song");
        music_.list({"1.mp3"});
    }

    ~ChosenDrive() override {
        engine_.reset();
        umount2(a_.c_str(), MNT_DETACH);
        umount2(b_.c_str(), MNT_DETACH);
    }

    void plugIn(const std::string& uuid, const std::filesystem::path& place) {
        struct stat status {};

        if (mount("none", place.c_str(), "tmpfs", 0, "size=9m") != 0 ||
            stat(place.c_str(), &status) != 0) {
            throw std::system_error(errno, std::generic_category(), "mount");
        }
        disks_.plugIn(uuid, "the label of " + uuid, status.st_dev);
    }

    void pullOut(const std::string& uuid, const std::filesystem::path& place) {
        disks_.pullOut(uuid);
        ASSERT_EQ(umount2(place.c_str(), MNT_DETACH), 0);
    }

    void chooseWearable(const std::filesystem::path& directory) {
        EXPECT_EQ(recorder_.ask(&engine::Client::setWearableDirectory, directory.string()), "");
    }

    void awaitConnected(const std::filesystem::path& directory) {
        recorder_.awaitState([&](const engine::EngineState& state) {
            return state.wearable.directory == directory && state.wearable.isConnected;
        });
    }

    void awaitStatusWith(const std::string& text) {
        recorder_.awaitState([&](const engine::EngineState& state) {
            return state.engine.status.find(text) != std::string::npos;
        });
    }

    finding::test::DiskServiceDouble disks_;
    tests::TemporaryDirectory folder_;
    const std::filesystem::path a_ = folder_ / "a";
    const std::filesystem::path b_ = folder_ / "b";
};

TEST_F(ChosenDrive, IsFollowedToAnotherPathAndStaysTheOneThatWasChosen) {
    plugIn("ABCD", a_);
    start();
    chooseWearable(a_);
    awaitConnected(a_);

    ASSERT_EQ(mount(a_.c_str(), b_.c_str(), nullptr, MS_MOVE, nullptr), 0);

    awaitConnected(b_);
    EXPECT_EQ(get(preferences::wearableDirectory), a_);
    EXPECT_EQ(get(preferences::wearableIdentity), "ABCD:" + a_.string());
}

TEST_F(ChosenDrive, IsFoundAtAnotherPathWhenTheEngineStarts) {
    plugIn("ABCD", b_);
    set(preferences::wearableIdentity, "ABCD:" + a_.string());
    set(preferences::wearableDirectory, a_ / "Velora");
    folder_.makeDirectory("b/Velora");

    start();

    awaitConnected(b_ / "Velora");
}

TEST_F(ChosenDrive, ThatIsAwayIsNotAnyOtherInItsPlace) {
    plugIn("ABCD", a_);
    choose();
    start();
    chooseWearable(a_);
    awaitConnected(a_);
    awaitStatusWith("Everything is up to date.");

    pullOut("ABCD", a_);
    awaitStatusWith("is not plugged in");
    plugIn("EF01", a_);

    awaitStatusWith("not connected. Another drive, “the label of EF01”, is at " + a_.string());
    EXPECT_FALSE(recorder_.state().wearable.isConnected);
    EXPECT_TRUE(std::filesystem::is_empty(a_));

    chooseWearable(a_);
    awaitConnected(a_);
    EXPECT_EQ(get(preferences::wearableIdentity), "EF01:" + a_.string());
}

TEST_F(ChosenDrive, ThatSettingsOfOldKnowByItsPathOnlyIsTakenByThat) {
    set(preferences::wearableDirectory, a_);
    plugIn("ABCD", a_);
    start();
    awaitConnected(a_);

    pullOut("ABCD", a_);
    plugIn("EF01", a_);

    awaitConnected(a_);
    EXPECT_EQ(get(preferences::wearableIdentity), "");
}

TEST_F(ChosenDrive, IsForgottenWhenAnotherWearableIsChosen) {
    plugIn("ABCD", a_);
    start();
    chooseWearable(a_);
    awaitConnected(a_);

    chooseWearable(std::filesystem::path());

    awaitConnected(wearable_);
    EXPECT_EQ(get(preferences::wearableIdentity), "");
    EXPECT_EQ(get(preferences::wearableDirectory), "");
}

} // namespace
