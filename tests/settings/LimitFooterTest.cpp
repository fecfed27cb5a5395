#include <limits>

#include <gmock/gmock.h>

#include "platform/SizeFormatter.h"
#include "settings/LMSyncLimitType.h"
#include "tests/settings/Pane.h"

namespace {

using quorl::SongSizes;
using quorl::SyncPreference;
using quorl::tests::drain;
using quorl::tests::PaneTest;
using std::chrono::milliseconds;
using std::chrono::seconds;
using testing::ElementsAre;
using testing::StartsWith;

constexpr std::uint64_t megabyte = 1ULL << 20U;

class LimitFooter : public PaneTest {
  protected:
    void limitTo(std::uint64_t type, std::uint64_t amount) {
        store(SyncPreference::AssetSyncLimitType, type);
        store(SyncPreference::AssetSyncLimit, amount);
    }

    /// "Morning" with songs of these sizes is chosen and was sent, without a limit.
    void syncSongs(const SongSizes& sizes) {
        morning_->setSongSizes(sizes);
        chooseMorning();
        sendMorning();
        limitTo(2, 0);
    }

    /// Shows the pane, which works the footer out first.
    void showFooter() {
        pane_ = create<LMQuorlSettingsController>();
        navigation_->setRootPane(pane_);
        (void)pane_->specifiers();
        navigation_->appear(false);
    }

    /// Answers every question that is open.
    void reply(double available, double songs) {
        while (host_->wearable.openQuestions() > 0) {
            host_->wearable.reply({available, songs});
        }
        drain();
    }

    [[nodiscard]] std::optional<std::string> footer() { return shownFooter("Music Storage"); }

    static std::string size(std::uint64_t bytes) {
        return CPFSSizeStrings(static_cast<float>(bytes));
    }

    static std::string synced(const std::string& count, std::uint64_t bytes) {
        return count + " songs synced to Velora, taking up " + size(bytes) + ".";
    }
};

// How many songs fit.

struct Fit {
    const char* situation;
    std::uint64_t type;
    std::uint64_t amount;
    SongSizes sizes;
    const char* count;
    std::uint64_t bytes;
};

class FittingSongs : public LimitFooter, public testing::WithParamInterface<Fit> {};

TEST_P(FittingSongs, AreThoseFromTheTopToTheFirstThatDoesNotFit) {
    syncSongs(GetParam().sizes);
    limitTo(GetParam().type, GetParam().amount);

    showFooter();

    EXPECT_EQ(footer(), synced(GetParam().count, GetParam().bytes)) << GetParam().situation;
}

INSTANTIATE_TEST_SUITE_P(
    Table, FittingSongs,
    testing::Values(
        Fit{"empty playlist", 0, 100, {}, "0", 0}, Fit{"limit of no songs", 1, 0, {1, 2}, "0", 0},
        Fit{"limit of no megabytes", 0, 0, {1, 2}, "0", 0},
        Fit{"limit of no megabytes and songs of no size", 0, 0, {0, 0}, "2", 0},
        Fit{"first song too large, a later one not", 0, 1, {2 * megabyte, 1}, "0", 0},
        Fit{"later song too large, a still later one not",
            0,
            10,
            {4 * megabyte, 5 * megabyte, 2 * megabyte, 1},
            "2",
            9 * megabyte},
        Fit{"limit exactly reached", 0, 3, {megabyte, 2 * megabyte}, "2", 3 * megabyte},
        Fit{"limit passed by one byte",
            0,
            3,
            {megabyte, megabyte, megabyte + 1},
            "2",
            2 * megabyte},
        Fit{"fewer songs than the limit", 1, 250, {5, 6}, "2", 11},
        Fit{"more songs than the limit", 1, 2, {10, 20, 30, 40, 50}, "2", 30},
        Fit{"as many songs as the limit", 1, 3, {10, 20, 30}, "3", 60},
        Fit{"type that limits nothing", 2, 1, {10 * megabyte, 20 * megabyte}, "2", 30 * megabyte},
        Fit{"largest type", std::numeric_limits<NSUInteger>::max(), 0, {10, 20}, "2", 30},
        Fit{"song whose size is not known", 1, 5, {std::nullopt, 7}, "2", 7},
        Fit{"more bytes than 32 bits hold",
            0,
            8192,
            {5000 * megabyte, 3000 * megabyte},
            "2",
            8000 * megabyte}));

TEST_F(LimitFooter, CountsAMissingLimitAsNone) {
    syncSongs({1, 2});
    limitTo(LMSyncLimitTypeSongs, 0);
    store(SyncPreference::AssetSyncLimit, std::nullopt);

    showFooter();

    EXPECT_EQ(footer(), synced("0", 0));
}

TEST_F(LimitFooter, ReadsTheSizeOfTheSongAtTheLimitAndOfNoneBehindIt) {
    syncSongs({10, 20, 30, 40});
    limitTo(LMSyncLimitTypeSongs, 2);
    showFooter();
    host_->journal.clear();

    changeLibrary();

    EXPECT_THAT(host_->journal.lines({"property"}),
                testing::IsSupersetOf({"property 1 MPMediaItemPropertyFileSize",
                                       "property 2 MPMediaItemPropertyFileSize",
                                       "property 3 MPMediaItemPropertyFileSize"}));
    EXPECT_EQ(host_->journal.count("property 4 MPMediaItemPropertyFileSize"), 0U);
}

// What it says.

enum class Situation { Synced, Pending, Preparing, Syncing };

struct Sentence {
    Situation situation;
    int songs;
    bool isSpaceKnown;
    const char* key;
    const char* text; ///< SIZE and LEFT stand for the size texts
};

class Sentences : public LimitFooter, public testing::WithParamInterface<Sentence> {
  protected:
    void arrange(Situation situation) {
        syncSongs(SongSizes(static_cast<std::size_t>(GetParam().songs), 3 * megabyte));
        switch (situation) {
        case Situation::Synced:
            break;
        case Situation::Pending:
            store(SyncPreference::LastFullySentAssetSyncPlaylistVersion, 0);
            break;
        case Situation::Preparing:
            beginPreparation();
            break;
        case Situation::Syncing:
            beginSync(4, 0.25);
            break;
        }
    }

    /// The key of the sentence that was looked up last.
    [[nodiscard]] std::string lastFooterKey() const {
        std::string last;
        for (const std::string& line : host_->journal.lines({"text"})) {
            const std::string key = line.substr(line.find(' ') + 1);
            last = key.starts_with("SYNC_SETTINGS_FOOTER_") ? key : last;
        }
        return last;
    }

    static std::string filled(std::string text, const std::string& bytes,
                              const std::string& remaining) {
        for (const auto& [word, value] : {std::pair("SIZE", bytes), std::pair("LEFT", remaining)}) {
            if (const auto at = text.find(word); at != std::string::npos) {
                text.replace(at, 4, value);
            }
        }
        return text;
    }
};

TEST_P(Sentences, FollowFromTheStageTheSongsAndTheSpace) {
    arrange(GetParam().situation);
    showFooter();
    if (GetParam().isSpaceKnown) {
        reply(1'000'000'000, 500'000'000);
    }

    EXPECT_EQ(footer(), filled(GetParam().text,
                               size(static_cast<std::uint64_t>(GetParam().songs) * 3 * megabyte),
                               size(1'500'000'000)));
    EXPECT_EQ(lastFooterKey(), GetParam().key);
}

constexpr auto inSync = Situation::Synced;
constexpr auto pending = Situation::Pending;
constexpr auto preparing = Situation::Preparing;
constexpr auto syncing = Situation::Syncing;

INSTANTIATE_TEST_SUITE_P(
    Table, Sentences,
    testing::Values(
        Sentence{inSync, 1, false, "SYNC_SETTINGS_FOOTER_SYNCED_1_SONG_UNKNOWN_SPACE_REMAINING",
                 "1 song synced to Velora, taking up SIZE."},
        Sentence{inSync, 1, true, "SYNC_SETTINGS_FOOTER_SYNCED_1_SONG",
                 "1 song synced to Velora, taking up SIZE with LEFT remaining."},
        Sentence{inSync, 0, false, "SYNC_SETTINGS_FOOTER_SYNCED_N_SONGS_UNKNOWN_SPACE_REMAINING",
                 "0 songs synced to Velora, taking up SIZE."},
        Sentence{inSync, 3, false, "SYNC_SETTINGS_FOOTER_SYNCED_N_SONGS_UNKNOWN_SPACE_REMAINING",
                 "3 songs synced to Velora, taking up SIZE."},
        Sentence{inSync, 3, true, "SYNC_SETTINGS_FOOTER_SYNCED_MB_N_SONGS",
                 "3 songs synced to Velora, taking up SIZE with LEFT remaining."},
        Sentence{pending, 1, false,
                 "SYNC_SETTINGS_FOOTER_SYNC_PENDING_1_SONG_UNKNOWN_SPACE_REMAINING",
                 "Will sync 1 song to Velora, which will take up SIZE"},
        Sentence{pending, 1, true, "SYNC_SETTINGS_FOOTER_SYNC_PENDING_1_SONG",
                 "Will sync 1 song to Velora, which will take up SIZE with LEFT remaining."},
        Sentence{pending, 2, false,
                 "SYNC_SETTINGS_FOOTER_SYNC_PENDING_N_SONGS_UNKNOWN_SPACE_REMAINING",
                 "Will sync 2 songs to Velora, which will take up SIZE."},
        Sentence{pending, 2, true, "SYNC_SETTINGS_FOOTER_SYNC_PENDING_N_SONGS",
                 "Will sync 2 songs to Velora, which will take up SIZE with LEFT remaining."},
        Sentence{preparing, 1, false,
                 "SYNC_SETTINGS_FOOTER_INDETERMINATE_SYNC_UNKNOWN_SPACE_REMAINING",
                 "Syncing music to Velora, which will take up SIZE."},
        Sentence{preparing, 2, false,
                 "SYNC_SETTINGS_FOOTER_INDETERMINATE_SYNC_UNKNOWN_SPACE_REMAINING",
                 "Syncing music to Velora, which will take up SIZE."},
        Sentence{preparing, 1, true, "SYNC_SETTINGS_FOOTER_INDETERMINATE_SYNC",
                 "Syncing music to Velora, which will take up SIZE with LEFT remaining."},
        Sentence{preparing, 2, true, "SYNC_SETTINGS_FOOTER_INDETERMINATE_SYNC",
                 "Syncing music to Velora, which will take up SIZE with LEFT remaining."},
        Sentence{syncing, 1, false, "SYNC_SETTINGS_FOOTER_SYNCING_1_SONG_UNKNOWN_SPACE_REMAINING",
                 "Currently 25% through syncing 1 song to Velora, which will take up SIZE."},
        Sentence{syncing, 1, true, "SYNC_SETTINGS_FOOTER_SYNCING_1_SONG",
                 "Currently 25% through syncing 1 song to Velora, which will take up SIZE with "
                 "LEFT remaining."},
        Sentence{syncing, 2, false, "SYNC_SETTINGS_FOOTER_SYNCING_N_SONGS_UNKNOWN_SPACE_REMAINING",
                 "Currently 25% through syncing 2 songs to Velora, which will take up SIZE."},
        Sentence{syncing, 2, true, "SYNC_SETTINGS_FOOTER_SYNCING_N_SONGS",
                 "Currently 25% through syncing 2 songs to Velora, which will take up SIZE with "
                 "LEFT remaining."}));

TEST_F(LimitFooter, AsksForTheProgressOnlyWhereItTellsIt) {
    const auto task = host_->sessionService.add("sync")->addAssetTask({.progress = 0.5});
    syncSongs({1, 2});
    showFooter();
    ASSERT_EQ(footer(), synced("2", 3));
    store(SyncPreference::LastFullySentAssetSyncPlaylistVersion, 0);
    changeLibrary();
    ASSERT_THAT(footer().value_or(""), StartsWith("Will sync"));
    task->become({.isRunning = true, .progress = 0.5});
    changeLibrary();
    ASSERT_THAT(footer().value_or(""), StartsWith("Syncing music"));
    task->become({.isRunning = true, .total = 4, .progress = 0.5});
    store(SyncPreference::AssetSyncEnabled, 0);
    changeLibrary();
    ASSERT_THAT(footer().value_or(""), StartsWith("No songs"));
    EXPECT_THAT(host_->journal.lines({"tasks"}), testing::IsEmpty());

    store(SyncPreference::AssetSyncEnabled, 1);
    changeLibrary();

    EXPECT_THAT(footer().value_or(""), StartsWith("Currently 50%"));
    EXPECT_THAT(host_->journal.lines({"tasks"}),
                ElementsAre("tasks sync " + DVDeviceSyncSessionAssetTaskGroupingKey));
}

constexpr const char* nothingSynced =
    "No songs synced to Velora. Pick a playlist to sync songs for local playback.";

TEST_F(LimitFooter, AsksForAPlaylistWhileSyncIsOffWhateverTheStage) {
    syncSongs({1, 2});
    store(SyncPreference::AssetSyncEnabled, 0);
    beginSync(3, 0.5);

    showFooter();

    EXPECT_EQ(footer(), nothingSynced);
}

TEST_F(LimitFooter, AsksForAPlaylistWhereNoneIsThere) {
    syncSongs({1, 2});
    host_->mediaLibrary().removePlaylist(morning_);
    showFooter();
    EXPECT_EQ(footer(), nothingSynced);

    reply(1, 2);
    EXPECT_EQ(footer(), nothingSynced);
}

TEST_F(LimitFooter, TakesThatSentenceAsItIsWithoutFillingIt) {
    host_->texts["SYNC_SETTINGS_FOOTER_NO_PLAYLIST"] = "100%% of %@";

    showFooter();

    EXPECT_EQ(footer(), "100%% of %@");
}

struct Percent {
    double progress;
    const char* text;
};

class Percentages : public LimitFooter, public testing::WithParamInterface<Percent> {};

TEST_P(Percentages, AreTruncatedAndNotHeldBelow100) {
    syncSongs({1, 2});
    beginSync(4, GetParam().progress);

    showFooter();

    ASSERT_TRUE(footer().has_value());
    EXPECT_THAT(*footer(), StartsWith(std::string("Currently ") + GetParam().text + "% through"));
}

INSTANTIATE_TEST_SUITE_P(Table, Percentages,
                         testing::Values(Percent{0.0, "0"}, Percent{0.005, "0"},
                                         Percent{0.42, "41"}, // as the nearest float is less
                                         Percent{0.5, "50"}, Percent{0.999, "99"},
                                         Percent{1.0, "100"}, Percent{1.5, "150"},
                                         Percent{-0.5, "0"},
                                         Percent{std::numeric_limits<double>::quiet_NaN(), "0"}));

TEST_F(LimitFooter, PutsItsFiguresWhereTheLanguageWantsThem) {
    syncSongs({1, 2, 3});
    beginSync(4, 0.25);
    host_->setLanguages({"de"});
    showFooter();
    reply(1'000'000'000, 500'000'000);

    EXPECT_EQ(shownFooter("Musikspeicher"),
              "3 Titel werden mit Velora synchronisiert, 25\u00a0% sind geschafft. Sie "
              "belegen dann " +
                  size(6) + ". Noch frei: " + size(1'500'000'000) + ".");
}

// What the wearable has left.

TEST_F(LimitFooter, DoesNotKnowTheSpaceBeforeTheWearableHasReplied) {
    syncSongs({1, 2});
    showFooter();
    EXPECT_EQ(footer(), synced("2", 3));
    EXPECT_THAT(host_->journal.lines({"wearable"}),
                ElementsAre("wearable connect", "wearable usage"));

    host_->wearable.reply({1'000'000'000, 500'000'000});
    EXPECT_EQ(footer(), synced("2", 3)) << "the reply comes on the main queue";
    drain();

    EXPECT_EQ(footer(), "2 songs synced to Velora, taking up " + size(3) + " with " +
                            size(1'500'000'000) + " remaining.");
}

struct Usage {
    const char* situation;
    quorl::UsageFigures figures; ///< free, and of the songs
    std::uint64_t remaining;
};

class UsageReplies : public LimitFooter, public testing::WithParamInterface<Usage> {};

TEST_P(UsageReplies, GiveTheFreeSpaceAndThatOfTheSongsTogether) {
    syncSongs({1, 2});
    showFooter();

    host_->wearable.reply(GetParam().figures);
    drain();

    EXPECT_EQ(footer(), "2 songs synced to Velora, taking up " + size(3) + " with " +
                            size(GetParam().remaining) + " remaining.")
        << GetParam().situation;
}

INSTANTIATE_TEST_SUITE_P(
    Table, UsageReplies,
    testing::Values(Usage{"both figures", {10.0, 20.0}, 30},
                    Usage{"songs missing", {10.0, std::nullopt}, 10},
                    Usage{"free space missing", {std::nullopt, 20.0}, 20},
                    Usage{"both missing", {}, 0}, Usage{"negative sum", {-10.0, 0.0}, 0},
                    Usage{"negative figure in a positive sum", {-10.0, 30.0}, 20},
                    Usage{"fraction of a byte", {10.5, 0.4}, 10}));

TEST_F(LimitFooter, AsksAgainAtTheNextRefreshWhereTheWearableDidNotAnswer) {
    syncSongs({1, 2});
    showFooter();

    host_->wearable.fail("The wearable is out of reach.");
    drain();
    EXPECT_EQ(footer(), synced("2", 3));
    EXPECT_EQ(host_->wearable.openQuestions(), 0U);

    changeLibrary();
    EXPECT_EQ(host_->wearable.openQuestions(), 1U);
}

TEST_F(LimitFooter, AsksAtEachRefreshUntilAReplyHasCome) {
    syncSongs({1, 2});
    showFooter();

    changeLibrary();
    changeLibrary();

    EXPECT_EQ(host_->wearable.openQuestions(), 3U);
    EXPECT_EQ(host_->journal.count("wearable connect"), 1U);
    reply(1, 2);
    changeLibrary();
    EXPECT_EQ(host_->wearable.openQuestions(), 0U);
}

TEST_F(LimitFooter, TakesTheLaterOfTwoReplies) {
    syncSongs({1, 2});
    showFooter();
    changeLibrary();

    host_->wearable.reply({100, 0});
    host_->wearable.reply({200, 0});
    drain();

    EXPECT_THAT(footer().value_or(""), testing::HasSubstr(size(200)));
}

struct Age {
    milliseconds duration;
    bool isFresh;
};

class FigureAges : public LimitFooter, public testing::WithParamInterface<Age> {};

TEST_P(FigureAges, DecideWhetherTheWearableIsAskedAgain) {
    syncSongs({1, 2});
    showFooter();
    reply(10, 20);

    host_->clock.moveBy(GetParam().duration);
    changeLibrary();

    EXPECT_EQ(host_->wearable.openQuestions(), GetParam().isFresh ? 0U : 1U);
    const std::string known =
        "2 songs synced to Velora, taking up " + size(3) + " with " + size(30) + " remaining.";
    EXPECT_EQ(footer(), GetParam().isFresh ? known : synced("2", 3));
}

INSTANTIATE_TEST_SUITE_P(Table, FigureAges,
                         testing::Values(Age{seconds(0), true}, Age{seconds(480), true},
                                         Age{milliseconds(480'500), false},
                                         Age{seconds(481), false}, Age{seconds(-480), true},
                                         Age{seconds(-481), false}));

TEST_F(LimitFooter, KeepsTheFigureOfAnOldReplyWhenTheNextOneFails) {
    syncSongs({1, 2});
    showFooter();
    reply(10, 20);
    host_->clock.moveBy(seconds(481));
    changeLibrary();

    host_->wearable.fail("gone");
    drain();
    EXPECT_EQ(footer(), synced("2", 3));

    host_->clock.moveBy(seconds(-481)); // the clock was set back to where it was
    changeLibrary();
    EXPECT_THAT(footer().value_or(""), testing::HasSubstr(size(30)));
}

TEST_F(LimitFooter, ShowsAQuestionMarkWhereTheFigureTurnsStaleInBetween) {
    syncSongs({1, 2});
    showFooter();
    reply(10, 20);

    host_->clock.setTick(seconds(481)); // fresh for the sentence, stale for the figure
    changeLibrary();

    EXPECT_EQ(footer(), "2 songs synced to Velora, taking up " + size(3) + " with ? remaining.");
    EXPECT_EQ(host_->wearable.openQuestions(), 1U);
}

// In which order, and how long the pane lives for it.

TEST_F(LimitFooter, IsClearedThenConnectedThenShownThenAskedFor) {
    syncSongs({1, 2});
    pane_ = create<LMQuorlSettingsController>();
    (void)pane_->specifiers();
    host_->journal.clear();

    pane_->viewWillAppear(false);

    EXPECT_THAT(host_->journal.lines({"footer", "wearable", "list"}),
                ElementsAre("footer null", "wearable connect", "footer " + synced("2", 3), "list",
                            "wearable usage"));
}

TEST_F(LimitFooter, IsSetAndShownAgainByTheReplyWithoutBeingClearedFirst) {
    syncSongs({1, 2});
    showFooter();
    host_->journal.clear();

    reply(10, 20);

    EXPECT_THAT(host_->journal.lines({"footer", "wearable", "list", "row"}),
                ElementsAre("footer 2 songs synced to Velora, taking up " + size(3) + " with " +
                                size(30) + " remaining.",
                            "list"));
}

TEST_F(LimitFooter, ReadsTypeLimitAndPlaylistThenTheStageThenWhatIsOn) {
    syncSongs({1});
    limitTo(LMSyncLimitTypeSongs, 5);
    showFooter();
    host_->journal.clear();

    reply(1, 2); // works the footer out, and reads nothing for a row

    EXPECT_THAT(
        host_->journal.lines({"read", "property", "size", "text"}),
        ElementsAre(
            "read assetSyncLimitType", "read assetSyncLimit", "read assetSyncEnabled",
            "read assetSyncPlaylistPersistentID", "property 1 MPMediaItemPropertyFileSize",
            // the stage
            "read assetSyncEnabled", "read assetSyncPlaylistPersistentID",
            "read assetSyncPlaylistPersistentID", "property 7 MPMediaEntityPropertyEntityRevision",
            "read lastFullySentAssetSyncPlaylistPersistentID",
            "read lastFullySentAssetSyncPlaylistVersion",
            // whether there is anything to tell
            "read assetSyncEnabled", "read assetSyncEnabled", "read assetSyncPlaylistPersistentID",
            "size 1", "size 3", "text SYNC_SETTINGS_FOOTER_SYNCED_1_SONG"));
}

TEST_F(LimitFooter, KeepsThePaneAliveUntilTheReplyHasCome) {
    syncSongs({1, 2});
    showFooter();
    drain();
    const std::weak_ptr<LMQuorlSettingsController> watched = pane_;

    navigation_->clear();
    pane_.reset();
    EXPECT_FALSE(watched.expired());

    host_->journal.clear();
    host_->wearable.reply({10, 20});
    drain();

    EXPECT_TRUE(watched.expired());
    EXPECT_EQ(host_->journal.count("list"), 1U) << "the reply was still worked out";
}

TEST_F(LimitFooter, LetsThePaneGoWithAFailedReplyToo) {
    showFooter();
    const std::weak_ptr<LMQuorlSettingsController> watched = pane_;
    navigation_->clear();
    pane_.reset();
    ASSERT_FALSE(watched.expired());

    host_->wearable.fail("gone");
    drain();

    EXPECT_TRUE(watched.expired());
}

} // namespace
