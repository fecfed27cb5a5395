// Devices that do not answer, directories that cannot be used, and means that have run out.

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <set>

#include <sys/resource.h>
#include <sys/stat.h>

#include "tests/engine/EngineFixture.h"
#include "tests/engine/SlowDevice.h"

namespace {

using namespace quorl::preferences;
using namespace quorl::syncd::testing;
using namespace quorl;
using Kind = Event::Kind;
using ::testing::EndsWith;
using ::testing::HasSubstr;

constexpr auto silence = "The Velora does not answer. Check its connection.";

class HangingDevice : public EngineTest {
  protected:
    void SetUp() override {
        if (!device_.isThere()) {
            GTEST_SKIP() << "only root may mount";
        }
        listLargeSongs();
    }

    SlowDevice device_;
};

TEST_F(HangingDevice, KeepsNoEngineFromEndingInTheMiddleOfASync) {
    start({"--wearable", device_.path()});
    recorder_.awaitState([](const auto& state) { return state.wearable.isConnected; });
    device_.stall();
    choose();
    recorder_.next(Kind::SessionWillBegin);
    device_.awaitStalled();

    EXPECT_EQ(end(), 0);

    const auto all = recorder_.all();
    const auto finished = std::ranges::find(all, Kind::SessionDidFinish, &Event::kind);
    ASSERT_NE(finished, all.end());
    EXPECT_EQ(finished->message, "The sync engine was ended.");
    EXPECT_EQ(get(lastFullySentAssetSyncPlaylistVersion), std::nullopt);
    device_.goOn();
    start({"--wearable", device_.path()});
    recorder_.awaitStatus("Everything is up to date.");
    EXPECT_EQ(syncd::testing::whatIsWrongWith(device_.path()), "");
}

TEST_F(HangingDevice, IsToldInASentenceAndSyncedOnceItAnswers) {
    device_.stall();
    start({"--wearable", device_.path(), "--retry-after", "1"});
    choose();
    EXPECT_EQ(recorder_.ask(&engine::Client::setRateLimit, 5), "");
    recorder_.awaitStatus(silence);
    EXPECT_EQ(recorder_.count(Kind::SessionWillBegin), 0);

    device_.goOn();

    EXPECT_TRUE(sessionEnd().success);
    recorder_.awaitStatus("Everything is up to date.");
}

TEST_F(HangingDevice, IsLeftForAnotherWearable) {
    const TemporaryDirectory other;
    device_.stall();
    start({"--wearable", device_.path()});
    device_.awaitStalled();
    choose();

    EXPECT_EQ(recorder_.ask(&engine::Client::setWearableDirectory, other.path().string()), "");

    EXPECT_TRUE(sessionEnd().success);
    EXPECT_EQ(contentsOf(other.path() / "Music").size(), 4);
}

TEST_F(HangingDevice, IsNoMusicFolderToSwitchTo) {
    start();
    device_.stall();
    const auto folder = recorder_.state().engine.musicFolder;

    EXPECT_THAT(recorder_.ask(&engine::Client::setMusicFolder, device_.path()),
                HasSubstr("does not answer. Check its connection."));

    choose();
    EXPECT_TRUE(sessionEnd().success);
    EXPECT_EQ(recorder_.state().engine.musicFolder, folder);
}

TEST_F(HangingDevice, ThatHasTheMusicFolderCannotKeepASyncFromBeingCancelledWhileItIsPlanned) {
    std::filesystem::copy(music_.path(), device_.path(), std::filesystem::copy_options::recursive);
    engine_ = std::make_unique<Process>(
        std::vector<std::string>{ENGINE_PROGRAM, "--music-folder", device_.path()});
    recorder_.next(Kind::EngineDidAppear);
    choose();
    EXPECT_TRUE(sessionEnd().success);
    recorder_.awaitStatus("Everything is up to date.");
    EXPECT_EQ(recorder_.ask(&engine::Client::setOnCharger, false), "");
    const auto song = std::filesystem::path(device_.path()) / "1.mp3";
    const auto text = textOf(song);
    std::ofstream(song) << text; // its contents have to be compared
    recorder_.awaitStatus("The wearable is not on its charger.");
    device_.stall();
    EXPECT_EQ(recorder_.ask(&engine::Client::setOnCharger, true), "");
    device_.awaitStalled();

    EXPECT_EQ(recorder_.ask(&engine::Client::cancel), "");

    recorder_.awaitStatus("Ending the sync. The sync was cancelled.");
    device_.goOn();
    EXPECT_EQ(sessionEnd().message, "The sync was cancelled.");
    EXPECT_EQ(get(lastFullySentAssetSyncPlaylistVersion), std::nullopt);
}

TEST_F(HangingDevice, ThatHasTheMusicFolderIsLeftForAnotherOne) {
    device_.stall();
    engine_ = std::make_unique<Process>(
        std::vector<std::string>{ENGINE_PROGRAM, "--music-folder", device_.path()});
    recorder_.next(Kind::EngineDidAppear);
    device_.awaitStalled();
    choose();
    recorder_.awaitStatus("Reading the music folder…");

    EXPECT_EQ(recorder_.ask(&engine::Client::setMusicFolder, music_.path().string()), "");

    EXPECT_TRUE(sessionEnd().success);
    EXPECT_EQ(end(), 0);
}

class Refused : public EngineTest {
  protected:
    void SetUp() override { start(); }

    /// Neither the one nor the other is taken, and what was there stays.
    void expectRefused(const std::string& directory, const std::string& why) {
        const auto before = recorder_.state();
        EXPECT_THAT(recorder_.ask(&engine::Client::setWearableDirectory, directory),
                    HasSubstr(why));
        EXPECT_THAT(recorder_.ask(&engine::Client::setMusicFolder, directory), HasSubstr(why));
        Recorder fresh;
        fresh.next(Kind::EngineDidAppear);
        EXPECT_EQ(fresh.state().wearable.directory, before.wearable.directory);
        EXPECT_EQ(fresh.state().engine.musicFolder, before.engine.musicFolder);
        EXPECT_NE(fresh.state().wearable.directory, directory);
    }

    const TemporaryDirectory place_;
};

TEST_F(Refused, IsAFile) {
    place_.write("file", "text");
    expectRefused((place_.path() / "file").string(), "is not a directory. Name one.");
}

TEST_F(Refused, IsAPipe) {
    const auto pipe = place_.path() / "pipe";
    ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);
    expectRefused(pipe.string(), "is not a directory. Name one.");
}

TEST_F(Refused, IsAPathThatDoesNotBeginAtTheTop) {
    expectRefused("Music", "is not a full path. Begin it with a slash.");
}

TEST_F(Refused, IsALinkThatLeadsToItself) {
    const auto link = place_.path() / "link";
    std::filesystem::create_symlink(link, link);
    expectRefused(link.string(), "cannot be read: Too many levels of symbolic links.");
}

class Claims : public EngineTest {
  protected:
    void SetUp() override {
        listLargeSongs();
        start();
        choose();
        ASSERT_TRUE(sessionEnd().success);
        recorder_.awaitStatus("Everything is up to date.");
    }
};

TEST_F(Claims, AreTakenBackWhenSomebodyRemovesASongFromTheWearable) {
    std::filesystem::remove(wearable_ / "Music/2.mp3");

    EXPECT_TRUE(sessionEnd().success);

    EXPECT_EQ(onWearable().size(), 4);
}

TEST_F(Claims, AreNeverMadeForAnEmptyWearable) {
    const TemporaryDirectory other;
    const auto before = recorder_.all().size();

    EXPECT_EQ(recorder_.ask(&engine::Client::setWearableDirectory, other.path().string()), "");
    EXPECT_TRUE(sessionEnd().success);

    const auto all = recorder_.all();
    for (std::size_t at = before; all[at].kind != Kind::SessionDidFinish; ++at) {
        const auto& state = *all[at].state;
        EXPECT_TRUE(state.wearable.directory != other.path() || state.engine.syncState != "synced");
    }
    EXPECT_EQ(contentsOf(other.path() / "Music").size(), 4);
}

class Means : public EngineTest {};

TEST_F(Means, OfSixtyFourOpenFilesAreEnoughForManySongs) {
    std::vector<std::string> names;
    for (int song = 0; song < 150; ++song) {
        names.push_back(std::to_string(song) + ".mp3");
        music_.write(names.back(), "song " + std::to_string(song));
    }
    music_.list(names);
    rlimit files{};
    ASSERT_EQ(getrlimit(RLIMIT_NOFILE, &files), 0);
    files.rlim_cur = 64;
    ASSERT_EQ(setrlimit(RLIMIT_NOFILE, &files), 0) << "the engine inherits it";
    start();

    choose();

    EXPECT_TRUE(sessionEnd().success) << recorder_.state().engine.lastMessage;
    EXPECT_EQ(onWearable().size(), names.size() + 1);
}

/// All that the engine has made, and nobody else may read or write.
std::vector<std::string> openToOthers(const std::filesystem::path& directory) {
    std::vector<std::string> open;
    for (const auto& entry : std::filesystem::recursive_directory_iterator(directory)) {
        const auto rights = entry.symlink_status().permissions();
        const auto mine = std::filesystem::perms::owner_all;
        const bool isMusic = entry.path().filename() == "Music";
        const auto allowed = isMusic ? mine | std::filesystem::perms(0055) : mine;
        if ((rights & ~allowed) != std::filesystem::perms::none) {
            open.push_back(entry.path());
        }
    }
    return open;
}

TEST_F(Means, AreForTheirOwnerWhateverTheMaskOfRights) {
    listLargeSongs();
    umask(0);
    start();
    choose();
    EXPECT_TRUE(sessionEnd().success);

    EXPECT_THAT(openToOthers(wearable_.parent_path()), ::testing::IsEmpty());
    EXPECT_THAT(openToOthers(std::filesystem::path(std::getenv("XDG_STATE_HOME")) / "quorl"),
                ::testing::IsEmpty());
}

TEST_F(Means, OfTheBusCarryNoOtherTextThanUtf8) {
    const TemporaryDirectory place;
    const auto folder = place.path() / "m\xFFsic";
    std::filesystem::create_directories(folder);
    std::filesystem::copy(music_.path(), folder, std::filesystem::copy_options::recursive);
    engine_ = std::make_unique<Process>(std::vector<std::string>{
        ENGINE_PROGRAM, "--music-folder", folder.string(), "--wearable", folder.string()});

    recorder_.next(Kind::EngineDidAppear);

    EXPECT_THAT(recorder_.state().engine.musicFolder, EndsWith("m\uFFFDsic"));
    EXPECT_THAT(recorder_.state().wearable.directory, EndsWith("m\uFFFDsic"));
    recorder_.awaitState([](const auto& state) { return state.wearable.isConnected; });
    EXPECT_THAT(recorder_.ask(&engine::Client::setMusicFolder, folder.string()),
                HasSubstr("is not in UTF-8. Rename it."));
    EXPECT_EQ(end(), 0);
}

TEST_F(Means, OfABusyEngineAnswerEverySwitchAndKeepTheLast) {
    start();
    constexpr int all = 301;
    std::promise<void> answered;
    std::vector<std::string> problems;
    for (int times = 0; times < all; ++times) {
        recorder_.client().setOnCharger(times % 2 != 0, [&](const std::string& problem) {
            problems.push_back(problem);
            if (problems.size() == all) {
                answered.set_value();
            }
        });
    }
    answered.get_future().get();

    EXPECT_EQ(std::set<std::string>(problems.begin(), problems.end()), std::set<std::string>{""});
    EXPECT_EQ(end(), 0);
    start();
    recorder_.awaitState([](const auto& state) {
        return state.wearable.isConnected && !state.wearable.isOnCharger;
    });
}

} // namespace
