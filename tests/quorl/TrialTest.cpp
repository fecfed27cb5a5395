// Other places than the chosen ones are for a trial, which changes nothing of what is chosen.

#include <filesystem>
#include <future>

#include <gmock/gmock.h>

#include "services/engine/Client.h"
#include "tests/quorl/QuorlProcess.h"
#include "tests/quorl/SampleMusic.h"
#include "tests/quorl/StoredPreferences.h"

namespace quorl::tests {

namespace {

using testing::HasSubstr;

/// What the trial's sync engine tells next of being there or not.
class TrialWatch {
  public:
    /// Waits until the engine is there, or is not.
    void waitFor(bool isThere) {
        std::unique_lock lock(mutex_);
        changed_.wait(lock, [&] { return isThere_ == isThere; });
    }

  private:
    std::mutex mutex_;
    std::condition_variable changed_;
    std::optional<bool> isThere_;
    engine::Client client_{[this](const engine::Event& event) {
                               const std::scoped_lock lock(mutex_);
                               isThere_ = event.state->isThere;
                               changed_.notify_all();
                           },
                           engine::trialBusName};
};

class Trial : public testing::Test {
  protected:
    [[nodiscard]] std::vector<std::string> arguments() const {
        return {"--text", "--music", other_.path().string()};
    }

    [[nodiscard]] static std::filesystem::path onWearable(const std::string& wearable) {
        return std::filesystem::path(qgetenv("XDG_DATA_HOME").toStdString()) / "quorl" / wearable /
               "Music/Other.m3u8";
    }

    static void chooseTheOnlyPlaylist(QuorlProcess& quorl) {
        quorl.say("1");
        quorl.readUntil("  2  ✓ None\n");
        quorl.say("1");
        quorl.readUntil("  1  ✓ Other: Synced\n");
    }

    SampleMusic chosen_;
    TemporaryDirectory other_;

    Trial() {
        other_.writeSongs({"a.flac"}, 1000);
        other_.write("Other.m3u8", "a.flac\n");
    }
};

TEST_F(Trial, syncsItsOwnChoiceToAWearableOfItsOwn) {
    QuorlProcess quorl(arguments());

    chooseTheOnlyPlaylist(quorl);

    EXPECT_TRUE(std::filesystem::exists(onWearable("trial-wearable")));
    EXPECT_FALSE(std::filesystem::exists(onWearable("wearable")));
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_EQ(quorl.errors(), "") << "nothing is the matter";
}

TEST_F(Trial, leavesWhatIsChosenAsItIs) {
    {
        QuorlProcess quorl(arguments());
        chooseTheOnlyPlaylist(quorl);
        EXPECT_EQ(quorl.end(), 0);
    }
    EXPECT_EQ(storedPreference("music-folder"), "'" + chosen_.path() + "'");
    EXPECT_EQ(storedPreference("asset-sync-enabled"), "false");
    QuorlProcess usual({"--text"});
    EXPECT_EQ(usual.end(), 0);
    EXPECT_THAT(usual.output(), HasSubstr("Synced Playlist: None"));
}

TEST_F(Trial, keepsNothingOfItsFolderForTheNextStart) {
    const auto kept =
        std::filesystem::path(qgetenv("XDG_CACHE_HOME").toStdString()) / "quorl/music-folder";
    {
        QuorlProcess quorl(arguments());
        chooseTheOnlyPlaylist(quorl);
        EXPECT_EQ(quorl.end(), 0);
    }
    EXPECT_FALSE(std::filesystem::exists(kept));
    QuorlProcess usual({"--text"});
    usual.say("1");
    usual.readUntil("Long Run");
    EXPECT_EQ(usual.end(), 0);
    EXPECT_TRUE(std::filesystem::exists(kept));
}

TEST_F(Trial, hasAnEngineForAsLongAsItIsThere) {
    TrialWatch watch;
    {
        QuorlProcess quorl(arguments());
        watch.waitFor(true);
        EXPECT_EQ(quorl.end(), 0);
        watch.waitFor(false);
    }
    QuorlProcess quorl(arguments());
    watch.waitFor(true);
    quorl.kill();
    watch.waitFor(false);
}

TEST_F(Trial, besideAnotherOneSaysSo) {
    QuorlProcess first(arguments());
    first.readUntil("Synced Playlist: None");
    TrialWatch().waitFor(true);

    QuorlProcess second(arguments());

    second.readErrorsUntil("Another trial is running. End that one first.");
    EXPECT_EQ(second.end(), 0);
    EXPECT_EQ(first.end(), 0);
}

TEST(ChosenMusicFolder, isTakenAtOnceWhenAnotherOneIsChosen) {
    const SampleMusic before;
    QuorlProcess quorl({"--text"});
    quorl.say("1");
    quorl.readUntil("Long Run");
    TemporaryDirectory other;
    other.writeSongs({"a.flac"}, 1000);
    other.write("Other.m3u8", "a.flac\n");

    storePreference("music-folder", other.path().string());

    quorl.readUntil("  1  Other\n");
    EXPECT_EQ(quorl.end(), 0);
}

} // namespace

} // namespace quorl::tests
