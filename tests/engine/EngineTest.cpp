// The engine as the app meets it: over the session bus.

#include <algorithm>
#include <csignal>
#include <fstream>
#include <limits>
#include <set>

#include <sdbus-c++/sdbus-c++.h>
#include <sys/file.h>
#include <sys/mount.h>
#include <sys/stat.h>

#include "quorl-syncd/transfer/device/Device.h"
#include "services/base/AtomicFile.h"
#include "services/engine/Names.h"
#include "services/preferences/ChosenPlaces.h"
#include "services/wearable/Generations.h"
#include "tests/engine/EngineFixture.h"
#include "tests/engine/SlowDevice.h"

namespace {

using namespace quorl::preferences;
using namespace quorl::syncd::testing;
using namespace quorl;
using Kind = Event::Kind;
using ::testing::HasSubstr;

constexpr auto upToDate = "Everything is up to date.";
const std::string slowly = "1000000";

class Engine : public EngineTest {};

TEST_F(Engine, SyncsTheChosenPlaylistThroughAllStagesInOrder) {
    listLargeSongs();
    start({"--rate-limit", slowly});

    choose();

    EXPECT_EQ(recorder_.next(Kind::SessionWillBegin).session.typeIdentifier,
              engine::deviceSyncType);
    EXPECT_EQ(recorder_.next(Kind::TaskWillBegin).task.groupingKey, engine::preparingGroupingKey);
    const auto preparing = recorder_.next(Kind::TaskDidBegin);
    EXPECT_TRUE(preparing.task.isRunning);
    EXPECT_EQ(preparing.task.totalItemCount, 0);
    EXPECT_EQ(recorder_.next(Kind::TaskWillBegin).task.groupingKey, engine::assetGroupingKey);
    const auto copying = recorder_.next(Kind::TaskDidBegin);
    EXPECT_TRUE(copying.task.isRunning);
    EXPECT_EQ(copying.task.totalItemCount, 3);
    EXPECT_EQ(recorder_.next(Kind::TaskDidFinish).task.groupingKey, engine::preparingGroupingKey);
    recorder_.next(Kind::TaskDidUpdate);
    const auto copied = recorder_.next(Kind::TaskDidFinish);
    EXPECT_EQ(copied.task.groupingKey, engine::assetGroupingKey);
    EXPECT_TRUE(copied.success);
    EXPECT_FALSE(copied.task.isRunning);
    EXPECT_EQ(copied.task.completedItemCount, 3);
    EXPECT_EQ(copied.task.progress, 1.0);
    const auto finished = sessionEnd();
    EXPECT_TRUE(finished.success) << finished.message;
    EXPECT_TRUE(finished.session.isFinished);
    EXPECT_EQ(recorder_.next(Kind::SessionDidVanish).session.path, finished.session.path);
    recorder_.awaitStatus(upToDate);

    EXPECT_EQ(onWearable(),
              (Contents{{"1.mp3", std::string(1'000'000, '1')},
                        {"2.mp3", std::string(1'000'000, '2')},
                        {"3.mp3", std::string(1'000'000, '3')},
                        {"List.m3u8", "#EXTM3U\n#PLAYLIST:List\n1.mp3\n2.mp3\n3.mp3\n"}}));
    EXPECT_EQ(recorder_.state().engine.lastMessage, "3 songs synced to Velora.");
    EXPECT_TRUE(recorder_.state().engine.lastSuccess);
    EXPECT_TRUE(recorder_.state().sessions.empty());
}

TEST_F(Engine, SaysThatEverythingWasSentOnlyWhenItIsThereAndBeforeTheSessionEnds) {
    listLargeSongs();
    std::promise<std::string> wrong;
    bool isTold = false;
    auto watching = SharedPreferences::open([&](const auto&, const KeySet& keys) {
        const bool isSent = keys.contains(lastFullySentAssetSyncPlaylistPersistentID.key) ||
                            keys.contains(lastFullySentAssetSyncPlaylistVersion.key);
        if (isSent && !std::exchange(isTold, true)) {
            const auto manifest = wearable::loadManifest(base::openRoot(wearable_.c_str()).get());
            wrong.set_value(manifest.sent ? syncd::testing::whatIsWrongWith(wearable_)
                                          : "the list is not complete");
        }
    });
    std::vector<std::optional<std::uint64_t>> versions;
    recorder_.onEvent([&](const Event& event) {
        if (event.kind == Kind::TaskDidUpdate || event.kind == Kind::TaskDidFinish) {
            versions.push_back(get(lastFullySentAssetSyncPlaylistVersion));
        }
    });
    start();

    choose();
    sessionEnd();

    EXPECT_EQ(wrong.get_future().get(), "");
    EXPECT_EQ(versions.front(), std::nullopt);
    EXPECT_EQ(versions.back(), revisionOf("List"));
    EXPECT_EQ(get(lastFullySentAssetSyncPlaylistPersistentID), idOf("List"));
}

TEST_F(Engine, DoesNothingWhenEverythingWasSentBefore) {
    listLargeSongs();
    start();
    choose();
    sessionEnd();
    end();

    start();
    recorder_.awaitStatus(upToDate);

    EXPECT_EQ(recorder_.count(Kind::SessionWillBegin), 1);
}

TEST_F(Engine, NeverSaysThatEverythingIsUpToDateBetweenAChoiceAndItsSync) {
    listLargeSongs();
    start();
    choose();
    sessionEnd();
    recorder_.awaitStatus(upToDate);
    const auto before = recorder_.all().size();

    limitTo(2, LimitType::Songs);
    sessionEnd();
    recorder_.awaitStatus(upToDate);

    std::set<std::string> said;
    const auto all = recorder_.all();
    for (auto event = all.begin() + static_cast<std::ptrdiff_t>(before); event != all.end();
         ++event) {
        said.insert(event->state->engine.syncState + ": " + event->state->engine.status);
    }
    EXPECT_THAT(said,
                ::testing::IsSupersetOf({"pending: About to sync music.", "syncing: Syncing music.",
                                         "synced: Everything is up to date."}));
    EXPECT_FALSE(said.contains("pending: Everything is up to date."));
}

TEST_F(Engine, BringsOnlyTheNewSongWhenThePlaylistIsEdited) {
    listLargeSongs();
    start();
    choose();
    sessionEnd();

    music_.write("4.mp3", "4");
    music_.list({"4.mp3", "1.mp3"});

    const auto begun = nextOfAssets(Kind::TaskDidBegin).task;
    EXPECT_EQ(begun.totalItemCount, 2);
    EXPECT_EQ(begun.completedItemCount, 1);
    EXPECT_TRUE(sessionEnd().success);
    recorder_.awaitStatus(upToDate);
    EXPECT_EQ(onWearable().size(), 3) << "two songs and the playlist";
    EXPECT_EQ(onWearable().at("4.mp3"), "4");
    EXPECT_EQ(get(lastFullySentAssetSyncPlaylistVersion), revisionOf("List"));
}

TEST_F(Engine, SyncsAgainWhenTheLimitIsChanged) {
    listLargeSongs();
    start();
    choose();
    sessionEnd();

    limitTo(2, LimitType::Songs);

    awaitSyncedWithin(2, LimitType::Songs);
    EXPECT_EQ(onWearable().size(), 3);
    limitTo(1, LimitType::Megabytes);
    awaitSyncedWithin(1, LimitType::Megabytes);
    EXPECT_EQ(onWearable().size(), 2);
}

TEST_F(Engine, IsCalmWhenNothingIsChosen) {
    start();
    recorder_.awaitStatus("Music sync is switched off.");
    set(assetSyncEnabled, true);
    recorder_.awaitStatus("No playlist is chosen.");
    set(assetSyncPlaylistPersistentID, 42);
    recorder_.awaitStatus("The chosen playlist is not in the music folder.");

    EXPECT_EQ(recorder_.count(Kind::SessionWillBegin), 0);
    EXPECT_EQ(recorder_.state().engine.lastMessage, "");
    EXPECT_EQ(recorder_.ask(&engine::Client::startNow),
              "The chosen playlist is not in the music folder.");
}

TEST_F(Engine, StopsInOrderWhenNoneIsChosenInTheMiddle) {
    listLargeSongs();
    start({"--rate-limit", slowly});
    choose();
    nextOfAssets(Kind::TaskDidUpdate);

    set(assetSyncEnabled, false);

    const auto finished = sessionEnd();
    EXPECT_FALSE(finished.success);
    EXPECT_EQ(finished.message, "Music sync is switched off.");
    recorder_.awaitStatus("Music sync is switched off.");
    EXPECT_EQ(get(lastFullySentAssetSyncPlaylistPersistentID), std::nullopt);
    EXPECT_EQ(whatIsWrongWith(wearable_), "");
    for (const auto& [name, text] : onWearable()) {
        EXPECT_FALSE(syncd::Device::isUnfinished(name)) << name;
    }
}

TEST_F(Engine, BeginsAnewWhenAnotherPlaylistIsChosenInTheMiddle) {
    listLargeSongs();
    music_.write("other.mp3", "other");
    music_.list({"other.mp3"}, "Other");
    start({"--rate-limit", slowly});
    choose();
    nextOfAssets(Kind::TaskDidUpdate);

    choose("Other");

    const auto first = sessionEnd();
    EXPECT_FALSE(first.success);
    EXPECT_EQ(first.message, "Something else was chosen.");
    const auto second = sessionEnd();
    EXPECT_TRUE(second.success);
    EXPECT_NE(first.session.path, second.session.path);
    recorder_.awaitStatus(upToDate);
    EXPECT_EQ(get(lastFullySentAssetSyncPlaylistPersistentID), idOf("Other"));
    EXPECT_EQ(onWearable(), (Contents{{"other.mp3", "other"},
                                      {"Other.m3u8", "#EXTM3U\n#PLAYLIST:Other\nother.mp3\n"}}));
}

TEST_F(Engine, SendsTheLastOfTenQuickChoicesDuringASync) {
    for (int number = 0; number < 10; ++number) {
        const auto name = std::to_string(number);
        music_.write(name + ".mp3", std::string(200'000, 'x') + name);
        music_.list({name + ".mp3"}, "List " + name);
    }
    listLargeSongs();
    start({"--rate-limit", slowly});
    choose();
    nextOfAssets(Kind::TaskDidUpdate);

    for (int number = 0; number < 10; ++number) {
        limitTo(1000 - static_cast<std::uint64_t>(number), LimitType::Songs);
        choose("List " + std::to_string(number));
    }

    recorder_.next([this](const Event& event) {
        return event.kind == Kind::SessionDidFinish && event.success &&
               get(lastFullySentAssetSyncPlaylistPersistentID) == idOf("List 9");
    });
    recorder_.awaitStatus(upToDate);
    EXPECT_EQ(onWearable(), (Contents{{"9.mp3", std::string(200'000, 'x') + "9"},
                                      {"List 9.m3u8", "#EXTM3U\n#PLAYLIST:List 9\n9.mp3\n"}}));
}

TEST_F(Engine, SendsTheRevisionThatItHasBegunAndTheNewOneAfterwards) {
    listLargeSongs();
    start({"--rate-limit", slowly});
    choose();
    nextOfAssets(Kind::TaskDidUpdate);

    music_.write("4.mp3", "4");
    music_.list({"1.mp3", "2.mp3", "3.mp3", "4.mp3"});

    EXPECT_TRUE(sessionEnd().success);
    EXPECT_TRUE(sessionEnd().success);
    EXPECT_EQ(get(lastFullySentAssetSyncPlaylistVersion), revisionOf("List"));
}

TEST_F(Engine, DoesNotBeginAgainByItselfAfterItWasCancelled) {
    listLargeSongs();
    start({"--rate-limit", slowly});
    choose();
    nextOfAssets(Kind::TaskDidUpdate);

    EXPECT_EQ(recorder_.ask(&engine::Client::cancel), "");

    EXPECT_EQ(sessionEnd().message, "The sync was cancelled.");
    recorder_.awaitStatus("The sync was cancelled.");
    EXPECT_EQ(recorder_.ask(&engine::Client::setRateLimit, 0), "");
    EXPECT_EQ(recorder_.ask(&engine::Client::startNow), "");
    EXPECT_TRUE(sessionEnd().success);
    recorder_.awaitStatus(upToDate);
    EXPECT_EQ(onWearable().size(), 4);
}

TEST_F(Engine, RemovesItsMusicWhenItIsToldToAndDoesNotBringItAgain) {
    listLargeSongs();
    start();
    choose();
    EXPECT_TRUE(sessionEnd().success);

    EXPECT_EQ(recorder_.ask(&engine::Client::removeMusic), "");

    EXPECT_TRUE(sessionEnd().success);
    EXPECT_FALSE(get(assetSyncEnabled));
    EXPECT_EQ(get(lastFullySentAssetSyncPlaylistVersion), std::nullopt);
    recorder_.awaitStatus("Music sync is switched off.");
    recorder_.awaitState([](const auto& state) { return state.wearable.songCount == 0; });
    EXPECT_TRUE(onWearable().empty());
}

TEST_F(Engine, BringsSongsOfAnyTimeOnce) {
    music_.write("before.mp3", "before 1970");
    music_.write("smallest.mp3", "as early as it goes");
    static_cast<void>(music_.setTime("before.mp3", -1));
    static_cast<void>(music_.setTime("smallest.mp3", std::numeric_limits<std::time_t>::min()));
    music_.list({"before.mp3", "smallest.mp3"});
    start();
    choose();
    EXPECT_TRUE(sessionEnd().success);
    EXPECT_EQ(onWearable().size(), 3);

    EXPECT_EQ(recorder_.ask(&engine::Client::startNow), "");

    EXPECT_EQ(nextOfAssets(Kind::TaskDidBegin).task.completedItemCount, 2) << "they are there";
    EXPECT_TRUE(sessionEnd().success);
}

/// What is in the place of the list on the wearable.
class StrangeManifest : public EngineTest {
  protected:
    StrangeManifest() {
        listLargeSongs();
        std::filesystem::create_directories(place_.parent_path());
    }

    /// Nothing is synced as long as it is there, and what people read says why.
    void refuse(const std::string& why) {
        start();
        choose();
        recorder_.awaitState(
            [&](const auto& state) { return state.engine.status.find(why) != std::string::npos; });
        EXPECT_EQ(recorder_.count(Kind::SessionWillBegin), 0);
        std::filesystem::remove(place_);
        EXPECT_EQ(recorder_.ask(&engine::Client::refreshWearable), "");
        EXPECT_TRUE(sessionEnd().success);
    }

    const std::filesystem::path place_ = wearable_ / ".quorl/manifest.1";
};

TEST_F(StrangeManifest, ThatIsAPipeIsNotWaitedFor) {
    ASSERT_EQ(mkfifo(place_.c_str(), 0600), 0);
    refuse("it is not a regular file");
}

TEST_F(StrangeManifest, OfAGigabyteIsNotRead) {
    std::ofstream file(place_);
    std::filesystem::resize_file(place_, std::uintmax_t{1} << 30);
    refuse("it is larger than 64 MiB");
}

TEST_F(Engine, MovesItsProgressWithinOneLargeSongAndNeverBackwards) {
    music_.write("large.mp3", std::string(2'000'000, 'x'));
    music_.list({"large.mp3"});
    start({"--rate-limit", "2000000"});

    choose();
    sessionEnd();

    double last = 0.0;
    int steps = 0;
    for (const auto& event : recorder_.all()) {
        if (event.task.groupingKey == engine::assetGroupingKey) {
            EXPECT_GE(event.task.progress, last);
            EXPECT_LE(event.task.progress, 1.0);
            EXPECT_TRUE(event.task.progress < 1.0 || event.kind == Kind::TaskDidFinish);
            steps += event.task.progress > last ? 1 : 0;
            last = event.task.progress;
        }
    }
    EXPECT_GE(steps, 4);
    EXPECT_EQ(last, 1.0);
}

TEST_F(Engine, WaitsForTheChargerAndRemembersItOverARestart) {
    listLargeSongs();
    start();
    EXPECT_EQ(recorder_.ask(&engine::Client::setOnCharger, false), "");
    choose();
    recorder_.awaitStatus("The wearable is not on its charger.");
    end();
    start();
    recorder_.awaitStatus("The wearable is not on its charger.");
    EXPECT_EQ(recorder_.count(Kind::SessionWillBegin), 0);

    EXPECT_EQ(recorder_.ask(&engine::Client::setOnCharger, true), "");

    EXPECT_TRUE(sessionEnd().success);
}

TEST_F(Engine, SyncsWithoutChargerWhenItIsToldTo) {
    listLargeSongs();
    start();
    EXPECT_EQ(recorder_.ask(&engine::Client::setOnCharger, false), "");
    choose();
    recorder_.awaitStatus("The wearable is not on its charger.");

    EXPECT_EQ(recorder_.ask(&engine::Client::startNow), "");

    EXPECT_TRUE(sessionEnd().success);
}

TEST_F(Engine, StopsWhenTheWearableIsTakenAwayAndGoesOnWhenItIsBack) {
    listLargeSongs();
    start({"--rate-limit", slowly});
    choose();
    nextOfAssets(Kind::TaskDidUpdate);

    EXPECT_EQ(recorder_.ask(&engine::Client::setConnected, false), "");

    EXPECT_EQ(sessionEnd().message, "The wearable is not connected.");
    EXPECT_EQ(recorder_.ask(&engine::Client::setRateLimit, 0), "");
    EXPECT_EQ(recorder_.ask(&engine::Client::setConnected, true), "");
    EXPECT_TRUE(sessionEnd().success);
}

TEST_F(Engine, SaysThatThereIsNotEnoughSpaceAndTellsTheSizes) {
    listLargeSongs();
    start({"--embedded-capacity", "1048576"});
    recorder_.awaitState([](const auto& state) { return state.wearable.available == 1 << 20; });

    choose();

    const auto finished = sessionEnd();
    EXPECT_FALSE(finished.success);
    EXPECT_THAT(finished.message, HasSubstr("not enough space"));
    recorder_.awaitStatus(finished.message);
    EXPECT_TRUE(onWearable().empty());
}

TEST_F(Engine, TriesAgainByItselfWhatDidNotWork) {
    listLargeSongs();
    std::filesystem::create_directories(wearable_);
    auto others =
        base::openDirectory(base::openRoot(wearable_.c_str()).get(), wearable::ownDirectory);
    ASSERT_EQ(flock(others.get(), LOCK_EX), 0);
    start({"--retry-after", "1"});
    choose();
    const auto failed = sessionEnd();
    EXPECT_THAT(failed.message, HasSubstr("Another program is syncing"));
    recorder_.awaitStatus(failed.message);

    others = {};

    recorder_.next(
        [](const Event& event) { return event.kind == Kind::SessionDidFinish && event.success; });
    EXPECT_EQ(onWearable().size(), 4);
}

TEST_F(Engine, TellsTheLastResultAlsoAfterARestartAndOfEachWearableItsOwn) {
    listLargeSongs();
    start();
    choose();
    sessionEnd();
    end();
    const TemporaryDirectory other;

    start();

    const auto status = recorder_.state().engine;
    EXPECT_TRUE(status.lastSuccess);
    EXPECT_EQ(status.lastMessage, "3 songs synced to Velora.");
    EXPECT_GT(status.lastTime, 0);
    set(assetSyncEnabled, false);
    recorder_.awaitStatus("Music sync is switched off.");
    EXPECT_EQ(recorder_.ask(&engine::Client::setWearableDirectory, other.path().string()), "");
    recorder_.awaitState([](const auto& state) { return state.engine.lastTime == 0; });
    EXPECT_EQ(recorder_.state().engine.lastMessage, "");
}

TEST_F(Engine, AnswersWhileTheWearableStallsAndCompletesTheSyncAfterwards) {
    SlowDevice device;
    if (!device.isThere()) {
        GTEST_SKIP() << "only root may mount";
    }
    listLargeSongs();
    start({"--wearable", device.path()});
    recorder_.awaitState([](const auto& state) { return state.wearable.isConnected; });

    device.stall();
    choose();
    recorder_.next(Kind::SessionWillBegin);
    device.awaitStalled();

    EXPECT_EQ(recorder_.ask(&engine::Client::setRateLimit, 5), "");
    EXPECT_EQ(recorder_.state().sessions.size(), 1);
    EXPECT_EQ(get(lastFullySentAssetSyncPlaylistVersion), std::nullopt);
    device.goOn();
    EXPECT_TRUE(sessionEnd().success);
    EXPECT_EQ(whatIsWrongWith(device.path()), "");
    EXPECT_EQ(get(lastFullySentAssetSyncPlaylistVersion), revisionOf("List"));
}

TEST_F(Engine, SyncsToADeviceThatIsPluggedInAndNoticesWhenItGoes) {
    listLargeSongs();
    const TemporaryDirectory media;
    const auto device = media.path() / "VELORA";
    start();
    EXPECT_EQ(recorder_.ask(&engine::Client::setWearableDirectory, device.string()), "");
    choose();
    recorder_.awaitState([](const engine::EngineState& state) {
        return state.engine.status.find("cannot be reached") != std::string::npos;
    });
    EXPECT_FALSE(recorder_.state().wearable.isConnected);
    EXPECT_THAT(recorder_.ask(&engine::Client::setOnCharger, true), HasSubstr("device"));

    std::filesystem::create_directory(device);

    EXPECT_TRUE(sessionEnd().success);
    EXPECT_EQ(contentsOf(device / "Music").size(), 4);
    recorder_.awaitState([](const auto& state) { return state.wearable.songs == 3'000'000; });
    EXPECT_TRUE(recorder_.state().wearable.isConnected);
    std::filesystem::remove_all(device);
    recorder_.awaitState([](const auto& state) { return !state.wearable.isConnected; });
    EXPECT_TRUE(onWearable().empty()) << "the embedded one is left alone";
}

TEST_F(Engine, DoesNotTakeTheDirectoryBelowForADeviceThatWasMountedAndIsGone) {
    listLargeSongs();
    const TemporaryDirectory place;
    start({"--wearable", place.path()});
    recorder_.awaitState([](const auto& state) { return state.wearable.isConnected; });
    if (mount("tmpfs", place.path().c_str(), "tmpfs", 0, "size=16m") != 0) {
        GTEST_SKIP() << "only root may mount";
    }
    recorder_.awaitState([](const auto& state) { return state.wearable.capacity == 16 << 20; });
    choose();
    EXPECT_TRUE(sessionEnd().success);

    ASSERT_EQ(umount2(place.path().c_str(), MNT_DETACH), 0);

    recorder_.awaitState([](const auto& state) { return !state.wearable.isConnected; });
    EXPECT_TRUE(contentsOf(place.path()).empty());
}

TEST_F(Engine, TakesAnotherMusicFolderAtRunTime) {
    listLargeSongs();
    Music other;
    other.write("a.mp3", "a");
    other.list({"a.mp3"});
    start();
    choose();
    sessionEnd();

    EXPECT_EQ(recorder_.ask(&engine::Client::setMusicFolder, other.path().string()), "");

    EXPECT_TRUE(sessionEnd().success);
    EXPECT_EQ(onWearable().at("a.mp3"), "a");
    EXPECT_EQ(recorder_.state().engine.musicFolder, other.path().string());
}

TEST_F(Engine, KeepsTheChosenPlacesForItsNextRun) {
    const TemporaryDirectory device;
    const auto run = [this] {
        engine_ = std::make_unique<Process>(std::vector<std::string>{ENGINE_PROGRAM});
        recorder_.next(Kind::EngineDidAppear);
    };
    run();
    EXPECT_EQ(recorder_.ask(&engine::Client::setMusicFolder, music_.path().string()), "");
    EXPECT_EQ(recorder_.ask(&engine::Client::setWearableDirectory, device.path().string()), "");
    end();

    run();
    EXPECT_EQ(recorder_.state().engine.musicFolder, music_.path());
    EXPECT_EQ(recorder_.state().wearable.directory, device.path());
    EXPECT_EQ(recorder_.ask(&engine::Client::setWearableDirectory, std::string()), "");
    end();

    run();
    EXPECT_TRUE(recorder_.state().wearable.isEmbedded);
}

TEST_F(Engine, TakesAMusicFolderThatIsChosenInTheSettings) {
    music_.list({});
    Music other;
    other.write("a.mp3", "a");
    other.list({"a.mp3"});
    engine_ = std::make_unique<Process>(std::vector<std::string>{ENGINE_PROGRAM});
    recorder_.next(Kind::EngineDidAppear);
    choose();

    set(preferences::musicFolder, other.path().string());

    EXPECT_TRUE(sessionEnd().success);
    EXPECT_EQ(onWearable().at("a.mp3"), "a");
}

TEST_F(Engine, TakesPlacesInTheSettingsThatDoNotBeginAtTheTopForNone) {
    set(preferences::musicFolder, "Songs");
    set(preferences::wearableDirectory, "Velora");
    engine_ = std::make_unique<Process>(std::vector<std::string>{ENGINE_PROGRAM});
    recorder_.next(Kind::EngineDidAppear);
    const auto usual = recorder_.state().engine.musicFolder;

    EXPECT_EQ(usual, preferences::usualMusicFolder());
    EXPECT_TRUE(recorder_.state().wearable.isEmbedded);

    set(preferences::musicFolder, music_.path().string());
    recorder_.awaitState(
        [this](const auto& now) { return now.engine.musicFolder == music_.path(); });
    set(preferences::musicFolder, "Songs");
    recorder_.awaitState([&](const auto& now) { return now.engine.musicFolder == usual; });
}

TEST_F(Engine, LeavesInOrderWhenItIsEndedInTheMiddle) {
    listLargeSongs();
    start({"--rate-limit", slowly});
    choose();
    nextOfAssets(Kind::TaskDidUpdate);

    EXPECT_EQ(end(), 0);

    const auto all = recorder_.all();
    const auto finished = std::ranges::find(all, Kind::SessionDidFinish, &Event::kind);
    ASSERT_NE(finished, all.end());
    EXPECT_EQ(finished->message, "The sync engine was ended.");
    EXPECT_EQ(whatIsWrongWith(wearable_), "");
    EXPECT_EQ(contentsOf(wearable_ / ".quorl").size(), 1);
}

TEST_F(Engine, LeavesTheNameToTheEngineThatHasIt) {
    start();

    Process second{{ENGINE_PROGRAM}};

    EXPECT_EQ(second.wait(), 3);
    EXPECT_THAT(second.rest(), HasSubstr("Another sync engine is running"));
    EXPECT_TRUE(recorder_.state().isThere);
}

TEST_F(Engine, EndsWithAMessageWhenTheBusGoesAway) {
    SecondBus bus;
    listLargeSongs();
    Process engine{{ENGINE_PROGRAM, "--music-folder", music_.path()},
                   {{"DBUS_SESSION_BUS_ADDRESS", bus.address()}}};
    const auto connection = sdbus::createSessionBusConnectionWithAddress(bus.address());
    const auto daemon =
        sdbus::createProxy(*connection, "org.freedesktop.DBus", "/org/freedesktop/DBus");
    for (bool isThere = false; !isThere;) {
        daemon->callMethod("NameHasOwner")
            .onInterface("org.freedesktop.DBus")
            .withArguments(std::string{engine::busName})
            .storeResultsTo(isThere);
    }

    bus.kill();

    EXPECT_EQ(engine.wait(), 2);
    EXPECT_THAT(engine.rest(), HasSubstr("The session bus is gone"));
}

TEST_F(Engine, SaysWhatToDoWhereThereIsNoBus) {
    Process engine{{ENGINE_PROGRAM}, {{"DBUS_SESSION_BUS_ADDRESS", "unix:path=/nowhere"}}};

    EXPECT_EQ(engine.wait(), 1);
    EXPECT_THAT(engine.rest(), HasSubstr("dbus-run-session"));
}

TEST_F(Engine, TellsItsOptionsAndItsVersion) {
    Process help{{ENGINE_PROGRAM, "--help"}};
    EXPECT_EQ(help.wait(), 0);
    EXPECT_THAT(help.rest(), HasSubstr("--music-folder"));

    Process version{{ENGINE_PROGRAM, "--version"}};
    EXPECT_EQ(version.wait(), 0);
    EXPECT_THAT(version.rest(), ::testing::StartsWith("quorl-syncd "));

    Process wrong{{ENGINE_PROGRAM, "--no-such-option"}};
    EXPECT_NE(wrong.wait(), 0);
}

TEST_F(Engine, TellsWhichPlaylistIsToBeSyncedAndHowFarThatIs) {
    const auto is = [](const std::string& state, const std::string& playlist) {
        return [=](const engine::EngineState& all) {
            return all.engine.syncState == state && all.engine.playlistName == playlist;
        };
    };
    listLargeSongs();
    start({"--rate-limit", slowly});
    recorder_.awaitState(is("off", ""));

    choose();

    recorder_.awaitState(is("syncing", "List"));
    recorder_.awaitState([](const engine::EngineState& all) {
        return !all.sessions.empty() && all.sessions.front().isProgressValid &&
               all.sessions.front().progress > 0;
    });
    recorder_.awaitState(is("synced", "List"));
    EXPECT_EQ(recorder_.ask(&engine::Client::setOnCharger, false), "");
    limitTo(1, LimitType::Songs);
    recorder_.awaitState(is("pending", "List"));
    set(assetSyncEnabled, false);
    recorder_.awaitState(is("off", ""));
}

TEST_F(Engine, DescribesItselfOnTheBus) {
    start();
    const auto connection = sdbus::createSessionBusConnection();
    const auto manager = sdbus::createProxy(*connection, engine::busName, engine::managerPath);
    std::map<sdbus::ObjectPath, std::map<std::string, std::map<std::string, sdbus::Variant>>>
        objects;
    manager->callMethod("GetManagedObjects")
        .onInterface("org.freedesktop.DBus.ObjectManager")
        .storeResultsTo(objects);
    std::string description;
    sdbus::createProxy(*connection, engine::busName, engine::enginePath)
        ->callMethod("Introspect")
        .onInterface("org.freedesktop.DBus.Introspectable")
        .storeResultsTo(description);

    EXPECT_EQ(objects.at(sdbus::ObjectPath{engine::wearablePath})
                  .at(engine::wearableInterface)
                  .at("Name")
                  .get<std::string>(),
              "Velora");
    EXPECT_THAT(description, HasSubstr("<method name=\"StartNow\""));
}

} // namespace
