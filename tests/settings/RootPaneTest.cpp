#include <limits>

#include <gmock/gmock.h>

#include "runtime/lists/ListView.h"
#include "settings/LMQuorlLimitChooser.h"
#include "settings/LMQuorlPlaylistChooser.h"
#include "settings/LMSyncLimitType.h"
#include "sync/LMQuorlSyncManager.h"
#include "tests/settings/Pane.h"

namespace {

using quorl::SyncPreference;
using quorl::tests::advance;
using quorl::tests::drain;
using quorl::tests::PaneTest;
using std::chrono::milliseconds;
using std::chrono::nanoseconds;
using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr milliseconds refreshDelay{1500};
constexpr milliseconds longAfter = 10 * refreshDelay;
constexpr nanoseconds instant{1};

constexpr const char* playlistRow = "row Synced Playlist";

class RootPane : public PaneTest {
  protected:
    static std::vector<std::string> titlesOf(const NSArray<PSSpecifier>& rows) {
        std::vector<std::string> titles;
        for (const auto& row : elements<PSSpecifier>(rows)) {
            titles.push_back(row->name().value_or("null"));
        }
        return titles;
    }

    [[nodiscard]] std::size_t refreshes() const { return host_->journal.count(playlistRow); }
};

// How it begins.

TEST_F(RootPane, BeginsWithItsTitleThenListensToTheLibraryAndTheSyncStatus) {
    pane_ = create<LMQuorlSettingsController>();

    ASSERT_NE(pane_, nullptr);
    EXPECT_EQ(pane_->title(), "Music");
    EXPECT_THAT(host_->journal.lines({"text", "observe", "sessions"}),
                ElementsAre("text SYNC_SETTINGS_ROOT_TITLE",
                            "observe MPMediaLibraryDidChangeNotification _updateUI any",
                            "observe UIApplicationDidEnterBackgroundNotification "
                            "_applicationDidEnterBackgroundNotification: any",
                            "observe UIApplicationWillEnterForegroundNotification "
                            "_applicationWillEnterForegroundNotification: any",
                            "observe DVSessionsDidChangeNotification "
                            "_drovanSessionsDidChangeNotification: any",
                            "observe LMSyncPreferencesDidChangeNotification "
                            "_syncPreferencesDidChangeNotification: any",
                            "sessions DVSessionTypeDeviceSync",
                            "observe LMQuorlSyncStatusDidChangeNotification "
                            "_syncStatusDidChangeNotification one"));
}

TEST_F(RootPane, ListensToTheSharedManagerOnly) {
    showPane();
    const auto stranger = create<NSObject>();

    NSNotificationCenter::defaultCenter().postNotificationName_object(
        LMQuorlSyncStatusDidChangeNotification, stranger.get());
    NSNotificationCenter::defaultCenter().postNotificationName_object(
        LMQuorlSyncStatusDidChangeNotification, nullptr);
    advance(longAfter);

    EXPECT_EQ(refreshes(), 0U);
}

TEST_F(RootPane, IsNotThereAndListensToNothingWithoutAHost) {
    quorl::Host::install(nullptr);
    EXPECT_EQ(create<LMQuorlSettingsController>(), nullptr);

    quorl::Host::install(host_);

    EXPECT_THAT(host_->journal.lines({"observe", "text"}), IsEmpty());
    (void)LMQuorlSyncManager::sharedManager();
    EXPECT_EQ(host_->journal.count("sessions DVSessionTypeDeviceSync"), 1U)
        << "the manager had not been made";
}

TEST_F(RootPane, KnowsTheBundleThatItComesFrom) {
    pane_ = create<LMQuorlSettingsController>();

    EXPECT_EQ(pane_->localizedPaneTitle(), "Music");
    EXPECT_EQ(pane_->bundle()->bundleIdentifier(), "org.quorl.velora.music-pane");
    EXPECT_EQ(pane_->applicationBundleIdentifier(), "org.quorl.velora.music-pane");
}

TEST_F(RootPane, StopsListeningWhenItGoes) {
    pane_ = create<LMQuorlSettingsController>();
    host_->journal.clear();

    pane_.reset();
    host_->mediaLibrary().beginGeneratingLibraryChangeNotifications();
    changeLibrary();

    EXPECT_EQ(host_->journal.count("leave"), 1U);
    EXPECT_THAT(host_->journal.lines({"row", "list"}), IsEmpty());
}

// Its rows.

TEST_F(RootPane, HasTwoGroupsOfOneRowEach) {
    pane_ = create<LMQuorlSettingsController>();

    const auto rows = elements<PSSpecifier>(pane_->specifiers());

    ASSERT_THAT(titlesOf(pane_->specifiers()),
                ElementsAre("Music Syncing", "Synced Playlist", "Music Storage", "Playlist Limit"));
    EXPECT_EQ(rows[0]->cellType(), PSCellType::Group);
    EXPECT_EQ(rows[0]->propertyForKey(PSFooterTextGroupKey),
              "This playlist syncs when Velora is on its charger. Once it's synced, this playlist "
              "will be available on Velora even when it's out of range of your Zanthe.");
    EXPECT_EQ(rows[0]->detailControllerClass(), std::nullopt);
    EXPECT_EQ(rows[1]->cellType(), PSCellType::LinkList);
    EXPECT_TRUE(rows[1]->detailControllerClass() == Class::of<LMQuorlPlaylistChooser>());
    EXPECT_EQ(rows[2]->cellType(), PSCellType::Group);
    EXPECT_EQ(rows[2]->propertyForKey(PSFooterTextGroupKey), std::nullopt);
    EXPECT_EQ(rows[3]->cellType(), PSCellType::LinkList);
    EXPECT_TRUE(rows[3]->detailControllerClass() == Class::of<LMQuorlLimitChooser>());
}

TEST_F(RootPane, HasTheGlanceRowOfTheMusicAppFirstWhereThereIsOne) {
    const auto glance = PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
        "Show in Glances", nullptr, std::nullopt, std::nullopt, std::nullopt, PSCellType::LinkList,
        std::nullopt);
    host_->glance = glance;
    pane_ = create<LMQuorlSettingsController>();

    EXPECT_THAT(titlesOf(pane_->specifiers()),
                ElementsAre("Show in Glances", "Music Syncing", "Synced Playlist", "Music Storage",
                            "Playlist Limit"));
    EXPECT_EQ(pane_->specifiers()->front(), glance);
    EXPECT_THAT(host_->journal.lines({"glance"}), ElementsAre("glance org.quorl.velora.music"));
}

TEST_F(RootPane, BuildsItsRowsOnceInOrder) {
    pane_ = create<LMQuorlSettingsController>();
    host_->journal.clear();

    const auto first = pane_->specifiers();
    const auto second = pane_->specifiers();

    EXPECT_EQ(first, second);
    EXPECT_THAT(host_->journal.lines({"text", "glance", "footer", "row", "list"}),
                ElementsAre("text SYNC_SETTINGS_PLAYLIST_SECTION_TITLE",
                            "text SYNC_SETTINGS_FOOTER_DESCRIPTION",
                            testing::StartsWith("footer This playlist syncs when Velora"),
                            "text SYNC_SETTINGS_PLAYLIST_CELL_LABEL",
                            "text SYNC_SETTINGS_USAGE_LIMIT_SECTION_TITLE",
                            "text SYNC_SETTINGS_USAGE_LIMIT_CELL_LABEL",
                            "glance org.quorl.velora.music"));
}

TEST_F(RootPane, DoesNotKeepItselfAliveThroughItsRows) {
    pane_ = create<LMQuorlSettingsController>();
    const auto rows = pane_->specifiers();
    const std::weak_ptr<LMQuorlSettingsController> watched = pane_;

    pane_.reset();

    EXPECT_TRUE(watched.expired());
    EXPECT_EQ((*rows)[1]->value(), std::nullopt);
}

TEST_F(RootPane, KeepsItsRowsWhateverIsChosen) {
    showPane();
    const auto before = pane_->specifiers();

    chooseMorning();
    host_->mediaLibrary().setMediaTypes(0);
    changeLibrary();
    postStatus();
    advance(refreshDelay);

    EXPECT_EQ(pane_->specifiers(), before);
}

TEST_F(RootPane, GivesItsRowsNothingButAGetterAndADetailPane) {
    pane_ = create<LMQuorlSettingsController>();

    const auto rows = elements<PSSpecifier>(pane_->specifiers());

    for (const auto& row : rows) {
        EXPECT_FALSE(row->setter()) << row->name().value_or("");
        EXPECT_EQ(row->editPaneClass(), std::nullopt) << row->name().value_or("");
    }
    for (const auto& group : {rows[0], rows[2]}) {
        EXPECT_EQ(group->target(), nullptr);
        EXPECT_FALSE(group->getter());
        EXPECT_EQ(group->detailControllerClass(), std::nullopt);
    }
    EXPECT_EQ(rows[1]->target(), pane_);
    EXPECT_EQ(rows[1]->getter()->name(), "playlistName:");
    EXPECT_EQ(rows[3]->target(), pane_);
    EXPECT_EQ(rows[3]->getter()->name(), "limit:");
}

// The playlist row.

TEST_F(RootPane, ShowsNoneWithoutAPlaylist) {
    showPane();

    EXPECT_EQ(shownValue("Synced Playlist"), "None");
}

TEST_F(RootPane, ShowsNoneWhileSyncIsOff) {
    chooseMorning();
    store(SyncPreference::AssetSyncEnabled, 0);
    showPane();

    EXPECT_EQ(shownValue("Synced Playlist"), "None");
}

TEST_F(RootPane, ShowsNoneWhereTheChosenPlaylistIsNotInTheLibrary) {
    chooseMorning();
    host_->mediaLibrary().removePlaylist(morning_);
    showPane();

    EXPECT_EQ(shownValue("Synced Playlist"), "None");
}

TEST_F(RootPane, ShowsThePlaylistOnceItIsSynced) {
    chooseMorning();
    sendMorning();
    showPane();

    EXPECT_EQ(shownValue("Synced Playlist"), "Morning");
}

TEST_F(RootPane, ShowsThatASyncIsPending) {
    chooseMorning();
    showPane();

    EXPECT_EQ(shownValue("Synced Playlist"), "Sync Pending…");
}

TEST_F(RootPane, ShowsThatASyncIsRunning) {
    chooseMorning();
    beginPreparation();
    showPane();
    EXPECT_EQ(shownValue("Synced Playlist"), "Syncing…");

    beginSync(10, 0.5);
    changeLibrary();
    EXPECT_EQ(shownValue("Synced Playlist"), "Syncing…");
}

TEST_F(RootPane, ShowsNoneWithoutMusicAlsoWhileASyncIsRunning) {
    chooseMorning();
    beginSync(10, 0.5);
    host_->mediaLibrary().setMediaTypes(1U << 3U); // something else than music
    showPane();

    EXPECT_EQ(shownValue("Synced Playlist"), "None");
}

TEST_F(RootPane, TakesMusicVideosForMusic) {
    chooseMorning();
    sendMorning();
    host_->mediaLibrary().setMediaTypes(MPMediaTypeMusicVideo);
    showPane();

    EXPECT_EQ(shownValue("Synced Playlist"), "Morning");
}

TEST_F(RootPane, AsksForMusicThenThePlaylistThenTheStage) {
    pane_ = create<LMQuorlSettingsController>();
    chooseMorning();
    host_->journal.clear();

    EXPECT_EQ(pane_->playlistName(nullptr), "Sync Pending…");

    const auto lines = host_->journal.lines({"library", "read", "query", "text"});
    ASSERT_GE(lines.size(), 6U);
    EXPECT_EQ(lines[0], "library hasMediaOfType 2049");
    EXPECT_EQ(lines[1], "read assetSyncEnabled");
    EXPECT_EQ(lines[2], "read assetSyncPlaylistPersistentID");
    EXPECT_EQ(lines[3], "query MPMediaPlaylistPropertyPersistentID=7");
    EXPECT_EQ(lines[4], "read assetSyncEnabled") << "of the stage";
    EXPECT_EQ(lines.back(), "text SYNC_SETTINGS_PLAYLIST_CELL_VALUE_TEXT_SYNC_PENDING");
}

TEST_F(RootPane, ReadsNoPreferencesWithoutMusic) {
    pane_ = create<LMQuorlSettingsController>();
    host_->mediaLibrary().setMediaTypes(0);
    host_->journal.clear();

    EXPECT_EQ(pane_->playlistName(nullptr), "None");

    EXPECT_THAT(host_->journal.lines({"read"}), IsEmpty());
}

TEST_F(RootPane, ShowsNoValueForASyncedPlaylistWithoutAName) {
    chooseMorning();
    sendMorning();
    morning_->setName(std::nullopt);
    showPane();

    EXPECT_EQ(shownValue("Synced Playlist"), std::nullopt);
}

// The limit row.

struct Limit {
    std::uint64_t type;
    std::optional<std::uint64_t> amount;
    std::string size; ///< the line of the size text that is asked for; empty for none
    std::string text; ///< what is shown; empty where it is the size formatter's
};

class LimitRow : public RootPane, public testing::WithParamInterface<Limit> {};

TEST_P(LimitRow, ShowsTheLimitInTheUnitOfItsType) {
    pane_ = create<LMQuorlSettingsController>();
    store(SyncPreference::AssetSyncLimitType, GetParam().type);
    store(SyncPreference::AssetSyncLimit, GetParam().amount);
    host_->journal.clear();

    const auto text = pane_->limit(nullptr);

    ASSERT_TRUE(text.has_value());
    if (GetParam().size.empty()) {
        EXPECT_EQ(text, GetParam().text);
        EXPECT_THAT(host_->journal.lines({"size"}), IsEmpty());
    } else {
        EXPECT_THAT(host_->journal.lines({"size"}), ElementsAre(GetParam().size));
        EXPECT_FALSE(text->empty());
    }
    EXPECT_THAT(host_->journal.lines({"read"}),
                ElementsAre("read assetSyncLimitType", "read assetSyncLimit"));
}

INSTANTIATE_TEST_SUITE_P(
    Table, LimitRow,
    testing::Values(Limit{1, 15, "", "15 Songs"}, Limit{1, 250, "", "250 Songs"},
                    Limit{1, 1234, "", "1,234 Songs"}, Limit{1, std::nullopt, "", "0 Songs"},
                    Limit{0, 100, "size 104857600", ""}, Limit{0, 2048, "size 2147483648", ""},
                    Limit{0, std::nullopt, "size 0", ""}, Limit{2, 500, "size 524288000", ""},
                    Limit{std::numeric_limits<NSUInteger>::max(), 1, "size 1048576", ""}));

TEST_F(RootPane, ShiftsTheLimitWithinTheMachineWord) {
    pane_ = create<LMQuorlSettingsController>();
    // One more than what the word can hold as bytes: the excess is lost.
    store(SyncPreference::AssetSyncLimit,
          (std::uint64_t{1} << (8 * sizeof(NSUInteger) - LMSyncLimitMegabyteShift)) + 3);
    host_->journal.clear();

    (void)pane_->limit(nullptr);

    EXPECT_THAT(host_->journal.lines({"size"}), ElementsAre("size 3145728"));
}

// Its texts.

TEST_F(RootPane, LooksItsTextsUpAtEachUse) {
    chooseMorning();
    showPane();
    ASSERT_EQ(shownValue("Synced Playlist"), "Sync Pending…");

    host_->texts["SYNC_SETTINGS_PLAYLIST_CELL_VALUE_TEXT_SYNC_PENDING"] = "Soon";
    changeLibrary();

    EXPECT_EQ(shownValue("Synced Playlist"), "Soon");
}

TEST_F(RootPane, SpeaksTheLanguageThatTheUserHasSwitchedTo) {
    pane_ = create<LMQuorlSettingsController>();

    host_->setLanguages({"de"});

    EXPECT_NE(pane_->localizedPaneTitle(), "Music");
    EXPECT_FALSE(pane_->localizedPaneTitle().empty());
    host_->setLanguages({"tlh"});
    EXPECT_EQ(pane_->localizedPaneTitle(), "Music") << "the English default";
}

TEST_F(RootPane, FillsItsFormatsAsTheTranslationWantsIt) {
    pane_ = create<LMQuorlSettingsController>();
    store(SyncPreference::AssetSyncLimitType, 1);
    store(SyncPreference::AssetSyncLimit, 125);

    host_->texts["SYNC_SETTINGS_USAGE_LIMIT_TYPE_N_SONGS"] = "Songs (%1$tu), 100%% %n %@";

    EXPECT_EQ(pane_->limit(nullptr), "Songs (125), 100% %n 125");
}

// When it is refreshed.

TEST_F(RootPane, BeginsToListenToTheLibraryAndRefreshesWhenItAppears) {
    pane_ = create<LMQuorlSettingsController>();
    navigation_->setRootPane(pane_);
    (void)pane_->specifiers();
    drain();
    host_->journal.clear();

    navigation_->appear(false);

    const auto lines = host_->journal.lines({"library", "row", "footer", "list", "wearable"});
    ASSERT_GE(lines.size(), 5U);
    EXPECT_EQ(lines[0], "library begin");
    EXPECT_EQ(lines[1], "row Synced Playlist");
    EXPECT_EQ(lines[2], "library hasMediaOfType 2049") << "the row's getter";
    EXPECT_EQ(lines[3], "row Playlist Limit");
    EXPECT_EQ(lines[4], "footer null");
    EXPECT_EQ(refreshes(), 1U);
}

class Appearances : public RootPane, public testing::WithParamInterface<bool> {
  protected:
    static std::string how() { return GetParam() ? "animated" : "at once"; }
};

TEST_P(Appearances, AreTheBaseClassesBeforeTheyAreThePanes) {
    showPane();

    pane_->viewWillDisappear(GetParam());
    EXPECT_THAT(host_->journal.lines({"disappear", "library"}),
                ElementsAre("disappear " + how(), "library end"));

    host_->journal.clear();
    pane_->viewWillAppear(GetParam());
    EXPECT_THAT(host_->journal.lines({"appear", "library", "row"}),
                ElementsAre("appear " + how(), "library begin", playlistRow,
                            "library hasMediaOfType 2049", "row Playlist Limit"));
}

INSTANTIATE_TEST_SUITE_P(BothWays, Appearances, testing::Bool());

TEST_F(RootPane, StopsHearingOfTheLibraryWhenItDisappears) {
    showPane();

    navigation_->disappear(false);
    changeLibrary();

    EXPECT_THAT(host_->journal.lines({"library", "row"}), ElementsAre("library end"));
}

TEST_F(RootPane, RefreshesAtOnceWhenTheLibraryChanges) {
    showPane();

    changeLibrary();

    EXPECT_EQ(refreshes(), 1U);
    EXPECT_EQ(host_->journal.count("row Playlist Limit"), 1U);
}

TEST_F(RootPane, RefreshesForAnyLibraryThatChanges) {
    showPane();

    post(MPMediaLibraryDidChangeNotification);

    EXPECT_EQ(refreshes(), 1U);
}

TEST_F(RootPane, DoesNothingForItsRowsBeforeTheyAreBuilt) {
    pane_ = create<LMQuorlSettingsController>();
    host_->journal.clear();

    pane_->viewWillAppear(false);

    EXPECT_THAT(host_->journal.lines({"row", "footer"}), ElementsAre("row null", "row null"));
    EXPECT_EQ(host_->journal.count("list"), 1U) << "the footer is worked out all the same";
}

TEST_F(RootPane, RefreshesOnceForABurstOfStatusChanges) {
    showPane();

    for (int change = 0; change < 10; ++change) {
        postStatus();
    }
    advance(refreshDelay - instant);
    EXPECT_EQ(refreshes(), 0U) << "not at once";
    advance(instant);
    EXPECT_EQ(refreshes(), 1U);

    advance(longAfter);
    EXPECT_EQ(refreshes(), 1U);
}

TEST_F(RootPane, DoesNotPushARefreshBackForLaterStatusChanges) {
    showPane();

    postStatus();
    advance(refreshDelay / 2);
    postStatus();
    advance(refreshDelay / 2);
    EXPECT_EQ(refreshes(), 1U);

    advance(longAfter);
    EXPECT_EQ(refreshes(), 1U);
}

TEST_F(RootPane, RefreshesAgainForAStatusChangeAfterTheRefresh) {
    showPane();
    postStatus();
    advance(refreshDelay);
    ASSERT_EQ(refreshes(), 1U);

    postStatus();
    advance(refreshDelay);

    EXPECT_EQ(refreshes(), 2U);
}

TEST_F(RootPane, RefreshesForTheStatusAlsoWhileItIsHidden) {
    showPane();
    navigation_->disappear(false);
    host_->journal.clear();

    postStatus();
    advance(refreshDelay);

    EXPECT_EQ(refreshes(), 1U);
}

TEST_F(RootPane, RefreshesAtOnceForTheLibraryWhileARefreshIsPending) {
    showPane();
    postStatus();

    changeLibrary();
    EXPECT_EQ(refreshes(), 1U);

    advance(longAfter);
    EXPECT_EQ(refreshes(), 2U) << "the pending one ran too";
    postStatus();
    advance(refreshDelay);
    EXPECT_EQ(refreshes(), 3U);
}

TEST_F(RootPane, TakesAStatusChangeDuringARefreshForPartOfThatRefresh) {
    showPane();
    host_->mediaLibrary().duringNextQuestion([this] { postStatus(); });

    postStatus();
    advance(refreshDelay);
    ASSERT_EQ(refreshes(), 1U);

    advance(longAfter);
    EXPECT_EQ(refreshes(), 1U);
}

TEST_F(RootPane, ThatHasGoneIsNotRefreshedAnyMore) {
    showPane();
    const std::weak_ptr<LMQuorlSettingsController> watched = pane_;
    host_->wearable.fail("gone"); // so that no question holds the pane
    drain();
    while (host_->wearable.openQuestions() > 0) {
        host_->wearable.fail("gone");
        drain();
    }
    postStatus();
    host_->journal.clear();

    navigation_->clear();
    pane_.reset();
    EXPECT_TRUE(watched.expired()) << "the pending refresh does not hold it";
    advance(longAfter);

    EXPECT_THAT(host_->journal.lines({"row", "list", "footer", "text"}), IsEmpty());
}

// The road of one event.

TEST_F(RootPane, ShowsAPlaylistThatWasChosenInItsDetailPane) {
    host_->mediaLibrary().addPlaylist(8, "Evening")->setRevision(1);
    chooseMorning();
    sendMorning();
    showPane();
    ASSERT_EQ(shownValue("Synced Playlist"), "Morning");

    tap("Synced Playlist");
    auto& chooser = dynamic_cast<LMQuorlPlaylistChooser&>(*navigation_->top());
    chooser.tableView_didSelectRowAtIndexPath(chooser.tableView(),
                                              NSIndexPath::indexPathForRow_inSection(1, 0));
    drain();
    EXPECT_THAT(host_->journal.lines({"post"}),
                Contains("post LMQuorlSyncStatusDidChangeNotification"));
    navigation_->pop(false);

    EXPECT_EQ(shownValue("Synced Playlist"), "Sync Pending…");
    store(SyncPreference::LastFullySentAssetSyncPlaylistPersistentID, 8);
    store(SyncPreference::LastFullySentAssetSyncPlaylistVersion, 1);
    changeLibrary();
    EXPECT_EQ(shownValue("Synced Playlist"), "Evening");
}

TEST_F(RootPane, ShowsALimitThatWasChosenInItsDetailPane) {
    store(SyncPreference::AssetSyncLimit, 100);
    showPane();

    tap("Playlist Limit");
    auto& chooser = dynamic_cast<LMQuorlLimitChooser&>(*navigation_->top());
    chooser.tableView_didSelectRowAtIndexPath(chooser.tableView(),
                                              NSIndexPath::indexPathForRow_inSection(1, 0));
    navigation_->pop(false);

    EXPECT_EQ(shownValue("Playlist Limit"), "15 Songs");
}

} // namespace
