#include <limits>

#include <gmock/gmock.h>

#include "settings/LMQuorlPlaylistCell.h"
#include "settings/LMQuorlPlaylistChooser.h"
#include "sync/LMQuorlSyncManager.h"
#include "tests/settings/TablePane.h"

namespace {

using quorl::PlaylistDouble;
using quorl::SyncPreference;
using quorl::tests::advance;
using quorl::tests::checked;
using quorl::tests::drain;
using quorl::tests::EmptyTable;
using quorl::tests::row;
using quorl::tests::TablePaneTest;
using std::chrono::milliseconds;
using std::chrono::nanoseconds;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr milliseconds updateDelay{1500};
constexpr milliseconds longAfter = 10 * updateDelay;
constexpr nanoseconds instant{1};

const NSIndexPath morningRow = row(0, 0);
const NSIndexPath eveningRow = row(1, 0);
const NSIndexPath noneRow = row(0, 1);

constexpr const char* reload = "table";

class PlaylistChooser : public TablePaneTest {
  protected:
    PlaylistChooser() : evening_(host_->mediaLibrary().addPlaylist(0x1'0000'0007, "Evening")) {
        evening_->setRevision(1);
    }

    /// Shows the chooser, with what the manager's first status sets off behind it.
    void showChooser() {
        (void)LMQuorlSyncManager::sharedManager();
        drain();
        show<LMQuorlPlaylistChooser>();
    }

    /// Shows the chooser on a screen with room for one row, that of "Morning", which was sent.
    /// Gives its cell.
    std::shared_ptr<UITableViewCell> showOnlyASyncedRow() {
        chooseMorning();
        sendMorning();
        rowsOnScreen_ = 1;
        showChooser();
        return cell(morningRow);
    }

    /// "Evening" was sent as it is.
    void sendEvening() {
        store(SyncPreference::LastFullySentAssetSyncPlaylistPersistentID, 0x1'0000'0007);
        store(SyncPreference::LastFullySentAssetSyncPlaylistVersion, 1);
    }

    /// The status that a row on the screen shows.
    [[nodiscard]] std::optional<std::string> status(const NSIndexPath& path) const {
        return cell(path)->detailTextLabel().text();
    }

    /// How often the stage was asked for while nothing is running: what was sent decides then.
    [[nodiscard]] std::size_t stageQuestions() const {
        return host_->journal.count("read lastFullySentAssetSyncPlaylistVersion");
    }

    [[nodiscard]] std::size_t reloads() const { return host_->journal.count(reload); }

    std::shared_ptr<PlaylistDouble> evening_;
};

// How it begins and goes.

TEST_F(PlaylistChooser, BeginsWithItsTitleAndThreeObserversAndNoList) {
    drain();
    host_->journal.clear();

    const auto chooser = create<LMQuorlPlaylistChooser>();

    EXPECT_EQ(chooser->title(), "Synced Playlist");
    EXPECT_EQ(chooser->style(), UITableViewStyle::Grouped);
    EXPECT_THAT(host_->journal.lines({"text", "read", "observe", "query", "library", "table"}),
                ElementsAre("text SYNC_SETTINGS_PLAYLIST_PICKER_TITLE",
                            "read lastFullySentAssetSyncPlaylistPersistentID",
                            "observe MPMediaLibraryDidChangeNotification "
                            "_mediaLibraryDidChangeNotification: any",
                            "observe LMQuorlSyncStatusDidChangeNotification "
                            "_quorlSyncStatusDidChangeNotification: any",
                            "observe LMSyncPreferencesDidChangeNotification "
                            "_syncPreferencesDidChangeNotification: any"));
    EXPECT_EQ(chooser->tableView_numberOfRowsInSection(chooser->tableView(), 0), 0);
    EXPECT_EQ(chooser->playlistAtPath(morningRow), nullptr);
}

TEST_F(PlaylistChooser, IsNotThereWithoutAHost) {
    quorl::Host::install(nullptr);
    EXPECT_EQ(create<LMQuorlPlaylistChooser>(), nullptr);
    quorl::Host::install(host_);
    EXPECT_THAT(host_->journal.lines({"observe"}), IsEmpty());
}

TEST_F(PlaylistChooser, LoadsTheListThenListensToTheLibraryWhenItAppears) {
    showChooser();

    const auto lines = host_->journal.lines({"appear", "library", "query", "table"});
    EXPECT_THAT(lines, ElementsAre("appear at once", "library hasMediaOfType 2049",
                                   "query MPMediaPlaylistPropertyIsFolder=0 "
                                   "MPMediaPlaylistPropertyIsAugurMix=0 "
                                   "MPMediaPlaylistPropertyIsAugurPlaylist=0",
                                   "table", "library begin"));
}

TEST_F(PlaylistChooser, StopsListeningToTheLibraryOnceItHasDisappeared) {
    showChooser();
    host_->journal.clear();

    table_->viewWillDisappear(false);
    EXPECT_THAT(host_->journal.lines({"library"}), IsEmpty());
    table_->viewDidDisappear(false);
    EXPECT_THAT(host_->journal.lines({"library"}), ElementsAre("library end"));

    changeLibrary();
    EXPECT_EQ(reloads(), 0U);
}

TEST_F(PlaylistChooser, ReloadsWhenTheAppBecomesActive) {
    showChooser();
    host_->journal.clear();

    controller_->willBecomeActive();

    EXPECT_EQ(reloads(), 1U);
}

// Its rows.

TEST_F(PlaylistChooser, ListsTheOrdinaryPlaylistsInTheLibrarysOrderAndNone) {
    const auto flagged = [this](const char* name, MPMediaProperty property) {
        host_->mediaLibrary()
            .addPlaylist(std::hash<std::string>{}(name), name)
            ->setProperty(property, NSNumber::numberWithBool(true));
    };
    flagged("a folder", MPMediaPlaylistPropertyIsFolder);
    flagged("a mix", MPMediaPlaylistPropertyIsAugurMix);
    flagged("a made one", MPMediaPlaylistPropertyIsAugurPlaylist);
    host_->mediaLibrary().addPlaylist(3, "A last one");
    showChooser();

    EXPECT_THAT(titles(), ElementsAre("Morning", "Evening", "A last one", "None"));
}

TEST_F(PlaylistChooser, HasTwoSectionsAndNoRowsInAnyOther) {
    showChooser();

    UITableView& tableView = table_->tableView();
    EXPECT_EQ(table_->numberOfSectionsInTableView(tableView), 2);
    EXPECT_EQ(table_->tableView_numberOfRowsInSection(tableView, 0), 2);
    EXPECT_EQ(table_->tableView_numberOfRowsInSection(tableView, 1), 1);
    EXPECT_EQ(table_->tableView_numberOfRowsInSection(tableView, 2), -1);
    EXPECT_EQ(table_->tableView_numberOfRowsInSection(tableView, -1), -1);
}

TEST_F(PlaylistChooser, HasOnlyNoneWhereTheLibraryHoldsNoMusic) {
    host_->mediaLibrary().setMediaTypes(0);
    showChooser();

    EXPECT_THAT(titles(), ElementsAre("None"));
    EXPECT_THAT(host_->journal.lines({"query"}), IsEmpty());
}

TEST_F(PlaylistChooser, TakesMusicVideosForMusic) {
    host_->mediaLibrary().setMediaTypes(MPMediaTypeMusicVideo);
    showChooser();

    EXPECT_THAT(titles(), ElementsAre("Morning", "Evening", "None"));
}

TEST_F(PlaylistChooser, ForgetsItsListWhenTheMusicHasGone) {
    showChooser();

    host_->mediaLibrary().setMediaTypes(0);
    changeLibrary();
    draw();

    EXPECT_THAT(titles(), ElementsAre("None"));
}

TEST_F(PlaylistChooser, ShowsAPlaylistWithoutAName) {
    morning_->setName(std::nullopt);
    showChooser();

    EXPECT_EQ(cell(morningRow)->textLabel().text(), std::nullopt);
}

TEST_F(PlaylistChooser, MakesItsOwnKindOfCellsInTheHostsColours) {
    host_->screen().looks.textColor = "#101010";
    showChooser();

    const auto made = cell(morningRow);
    EXPECT_NE(std::dynamic_pointer_cast<LMQuorlPlaylistCell>(made), nullptr);
    EXPECT_EQ(made->style(), UITableViewCellStyle::Value1);
    EXPECT_EQ(made->reuseIdentifier(), "PC");
    EXPECT_EQ(made->textLabel().textColor(), "#101010");
    EXPECT_EQ(made->tintColor(), "tint");
    EXPECT_EQ(cell(noneRow)->reuseIdentifier(), "PC");
}

TEST_F(PlaylistChooser, LeavesTheColoursOfACellThatItUsesAgain) {
    showChooser();

    host_->screen().looks.textColor = "#101010";
    controller_->willBecomeActive();
    draw();

    EXPECT_EQ(cell(morningRow)->textLabel().textColor(), std::nullopt);
}

// The checkmark and the status.

TEST_F(PlaylistChooser, ChecksNoneWhileSyncIsOff) {
    chooseMorning();
    store(SyncPreference::AssetSyncEnabled, 0);
    showChooser();

    EXPECT_THAT(checkedRows(), ElementsAre("None"));
    EXPECT_EQ(status(morningRow), std::nullopt);
    EXPECT_EQ(status(noneRow), std::nullopt);
}

TEST_F(PlaylistChooser, ChecksThePlaylistThatIsSynced) {
    chooseMorning();
    sendMorning();
    showChooser();

    EXPECT_THAT(checkedRows(), ElementsAre("Morning"));
    EXPECT_EQ(status(morningRow), "Synced");
    EXPECT_EQ(status(eveningRow), std::nullopt) << "only the low 32 bits of its id are the same";
}

TEST_F(PlaylistChooser, ChecksNothingWhereTheChosenPlaylistIsNotInTheLibrary) {
    store(SyncPreference::AssetSyncEnabled, 1);
    store(SyncPreference::AssetSyncPlaylistPersistentID, 99);
    showChooser();

    EXPECT_THAT(checkedRows(), IsEmpty());
}

TEST_F(PlaylistChooser, ChecksNothingWhereSyncIsOnWithoutAChoice) {
    store(SyncPreference::AssetSyncEnabled, 1);
    showChooser();

    EXPECT_THAT(checkedRows(), IsEmpty());
}

TEST_F(PlaylistChooser, ShowsThatTheSyncIsPending) {
    chooseMorning();
    showChooser();

    EXPECT_EQ(status(morningRow), "Sync Pending…");
}

TEST_F(PlaylistChooser, ShowsThatTheSyncIsBeingPrepared) {
    chooseMorning();
    beginPreparation();
    showChooser();

    EXPECT_EQ(status(morningRow), "Syncing…");
}

struct Percent {
    double progress;
    const char* text;
};

class ShownPercents : public PlaylistChooser, public testing::WithParamInterface<Percent> {};

TEST_P(ShownPercents, StayBetween1And99) {
    chooseMorning();
    beginSync(10, GetParam().progress);
    showChooser();

    EXPECT_EQ(status(morningRow), std::string(GetParam().text) + "% Synced…");
}

INSTANTIATE_TEST_SUITE_P(Table, ShownPercents,
                         testing::Values(Percent{0.0, "1"}, Percent{0.009, "1"},
                                         Percent{0.03125, "3"}, Percent{0.505, "50"},
                                         Percent{0.509, "50"},
                                         // 0.7 is a little less in single precision.
                                         Percent{0.7, "69"}, Percent{0.98, "98"},
                                         Percent{0.999, "99"}, Percent{1.0, "99"},
                                         Percent{7.0, "99"}, Percent{-0.5, "1"},
                                         Percent{std::numeric_limits<double>::quiet_NaN(), "1"},
                                         Percent{std::numeric_limits<double>::infinity(), "99"}));

TEST_F(PlaylistChooser, ReadsTheSwitchOnceForARowBesideTheSyncedPlaylist) {
    chooseMorning();
    beginPreparation(); // the stage then asks no preference
    rowsOnScreen_ = 1;
    showChooser();
    const auto readsOfRow = [this](NSInteger index) {
        scrollToRow(index);
        host_->journal.clear();
        draw();
        return host_->journal.lines({"read"});
    };

    EXPECT_THAT(readsOfRow(2), ElementsAre("read assetSyncEnabled"));
    EXPECT_THAT(readsOfRow(0), ElementsAre("read assetSyncEnabled", "read assetSyncEnabled",
                                           "read assetSyncPlaylistPersistentID"))
        << "the second and the third belong to the question for the synced playlist";
}

TEST_F(PlaylistChooser, ClearsTheStatusOfACellThatAnotherRowUses) {
    const auto used = showOnlyASyncedRow();
    ASSERT_EQ(used->detailTextLabel().text(), "Synced");

    scrollToRow(1);
    draw();
    ASSERT_EQ(cell(eveningRow), used);
    EXPECT_EQ(status(eveningRow), std::nullopt);
    EXPECT_FALSE(checked(used));
}

TEST_F(PlaylistChooser, ClearsTheStatusOfACellThatNoneUses) {
    const auto used = showOnlyASyncedRow();
    ASSERT_EQ(used->detailTextLabel().text(), "Synced");

    scrollToRow(2);
    draw();
    ASSERT_EQ(cell(noneRow), used);
    EXPECT_EQ(status(noneRow), std::nullopt);
    EXPECT_FALSE(checked(used));
}

// Choosing.

TEST_F(PlaylistChooser, WritesTheSwitchThenThePlaylistAndUpdatesTheRowsInPlace) {
    showChooser();
    host_->journal.clear();

    tapRow(morningRow);

    EXPECT_THAT(host_->journal.lines({"write", "deselect", "table", "rows", "query"}),
                ElementsAre("write assetSyncEnabled 1", "write assetSyncPlaylistPersistentID 7",
                            "deselect 0.0 fading"));
    EXPECT_THAT(checkedRows(), ElementsAre("Morning"));
    EXPECT_EQ(status(morningRow), "Sync Pending…");
}

TEST_F(PlaylistChooser, MovesTheCheckmarkAndTheStatusToTheNewChoice) {
    chooseMorning();
    sendMorning();
    showChooser();

    tapRow(eveningRow);

    EXPECT_THAT(checkedRows(), ElementsAre("Evening"));
    EXPECT_EQ(status(morningRow), std::nullopt);
    EXPECT_EQ(status(eveningRow), "Sync Pending…");
}

TEST_F(PlaylistChooser, SwitchesSyncOffAndKeepsTheChoiceWhenNoneIsTapped) {
    chooseMorning();
    showChooser();
    host_->journal.clear();

    tapRow(noneRow);

    EXPECT_THAT(host_->journal.lines({"read", "write", "deselect", "table"}),
                ElementsAre("write assetSyncEnabled 0", "deselect 1.0 fading"));
    EXPECT_EQ(host_->preferences.value(SyncPreference::AssetSyncPlaylistPersistentID), 7U);
    EXPECT_THAT(checkedRows(), ElementsAre("None"));
    EXPECT_EQ(status(morningRow), std::nullopt);
}

TEST_F(PlaylistChooser, WritesBothAgainAndRedrawsTheStatusWhenTheSyncedPlaylistIsTapped) {
    chooseMorning();
    const auto task = beginSync(10, 0.25);
    showChooser();
    host_->journal.clear();
    task->become({.isRunning = true, .total = 10, .progress = 0.5});

    tapRow(morningRow);

    EXPECT_THAT(host_->journal.lines({"write"}),
                ElementsAre("write assetSyncEnabled 1", "write assetSyncPlaylistPersistentID 7"));
    EXPECT_EQ(status(morningRow), "50% Synced…") << "it does not wait for an old sync to end";
}

TEST_F(PlaylistChooser, SwitchesSyncOffBeforeItLooksAtNoneAndAtThePlaylists) {
    showChooser();
    EmptyTable tableView(host_->journal);

    table_->tableView_didSelectRowAtIndexPath(tableView, noneRow);

    EXPECT_THAT(tableView.notes(), ElementsAre("write assetSyncEnabled 0", "cell 1.0", "cell 0.0",
                                               "cell 0.1", "deselect 1.0"));
}

TEST_F(PlaylistChooser, WritesAChoiceBeforeItLooksAtNoneAtTheOthersAndAtTheTappedRow) {
    showChooser();
    EmptyTable tableView(host_->journal);

    table_->tableView_didSelectRowAtIndexPath(tableView, morningRow);

    EXPECT_THAT(tableView.notes(),
                ElementsAre("write assetSyncEnabled 1", "write assetSyncPlaylistPersistentID 7",
                            "cell 1.0", "cell 0.1", "cell 0.0", "deselect 0.0"));
}

TEST_F(PlaylistChooser, ShowsNoneInWhateverSectionFollowsThePlaylists) {
    showChooser();

    const auto beyond = table_->tableView_cellForRowAtIndexPath(table_->tableView(), row(1, 2));

    EXPECT_EQ(beyond->textLabel().text(), "None");
}

TEST_F(PlaylistChooser, TakesATapBelowNoneForOneOnAPlaylist) {
    showChooser();

    tapRow(row(1, 2));

    EXPECT_EQ(host_->preferences.value(SyncPreference::AssetSyncEnabled), 1U);
    EXPECT_EQ(host_->preferences.value(SyncPreference::AssetSyncPlaylistPersistentID),
              0x1'0000'0007U);
}

TEST_F(PlaylistChooser, TakesTwoRowsWithOneIdForTwoPlaylists) {
    host_->mediaLibrary().addPlaylist(7, "Morning once more")->setRevision(1);
    chooseMorning();
    sendMorning();
    showChooser();

    tapRow(row(2, 0));

    EXPECT_THAT(checkedRows(), ElementsAre("Morning once more"));
    EXPECT_EQ(status(morningRow), std::nullopt);
    EXPECT_EQ(status(row(2, 0)), "Synced");
}

TEST_F(PlaylistChooser, ChangesNothingOffTheScreenUntilItComesBack) {
    chooseMorning();
    sendMorning();
    showChooser();
    setRowsOnScreen(1);
    scrollToRow(2);
    draw();

    tapRow(noneRow);
    scrollToRow(0);
    draw();

    EXPECT_THAT(checkedRows(), IsEmpty());
    EXPECT_EQ(status(morningRow), std::nullopt);
}

TEST_F(PlaylistChooser, ChoosesFromTheListThatIsShownAlsoWhenTheLibraryHasChanged) {
    showChooser();
    host_->mediaLibrary().removePlaylist(morning_);

    tapRow(eveningRow);

    EXPECT_EQ(host_->preferences.value(SyncPreference::AssetSyncPlaylistPersistentID),
              0x1'0000'0007U);
}

// Switching while a sync runs.

TEST_F(PlaylistChooser, ShowsANewChoiceAsPendingUntilTheNextUpdateWhileASyncRuns) {
    chooseMorning();
    beginSync(10, 0.5);
    showChooser();

    tapRow(eveningRow);
    EXPECT_EQ(status(eveningRow), "Sync Pending…");

    changeLibrary();
    draw();
    EXPECT_EQ(status(eveningRow), "Sync Pending…") << "a reload alone changes nothing";

    advance(updateDelay);
    draw();
    EXPECT_EQ(status(eveningRow), "50% Synced…");
}

TEST_F(PlaylistChooser, ShowsANewChoiceAsPendingWithoutAskingForTheStage) {
    chooseMorning();
    beginSync(10, 0.5);
    showChooser();
    tapRow(eveningRow);
    drain();
    endSync();
    sendEvening();

    host_->journal.clear();
    changeLibrary();
    draw();

    EXPECT_EQ(status(eveningRow), "Sync Pending…") << "though it is synced by now";
    EXPECT_EQ(stageQuestions(), 0U);
    advance(updateDelay);
    draw();
    EXPECT_EQ(status(eveningRow), "Synced");
    EXPECT_GT(stageQuestions(), 0U);
}

TEST_F(PlaylistChooser, WaitsForAnOldPendingSyncToo) {
    chooseMorning(); // never sent
    showChooser();
    tapRow(eveningRow);
    drain();
    beginPreparation();

    changeLibrary();
    draw();

    EXPECT_EQ(status(eveningRow), "Sync Pending…") << "not \"Syncing…\"";
}

TEST_F(PlaylistChooser, DoesNotWaitWhereTheOldSyncWasComplete) {
    chooseMorning();
    sendMorning();
    showChooser();
    tapRow(eveningRow);
    beginPreparation();

    changeLibrary();
    draw();

    EXPECT_EQ(status(eveningRow), "Syncing…");
}

TEST_F(PlaylistChooser, GoesOnWaitingWhenNoneIsTappedInBetween) {
    chooseMorning();
    beginSync(10, 0.5);
    showChooser();
    tapRow(eveningRow);

    tapRow(noneRow);
    endSync();
    sendEvening(); // nothing that the last tap finds would make it wait
    tapRow(eveningRow);

    EXPECT_EQ(status(eveningRow), "Sync Pending…") << "though it is synced by now";
    advance(updateDelay);
    draw();
    EXPECT_EQ(status(eveningRow), "Synced");
}

TEST_F(PlaylistChooser, TakesNoCurrentPlaylistForTheIdZero) {
    const auto zero = host_->mediaLibrary().addPlaylist(0, "Zero");
    zero->setRevision(1);
    beginSync(10, 0.5);
    showChooser();

    tapRow(row(2, 0));

    EXPECT_EQ(status(row(2, 0)), "50% Synced…") << "the same id, so nothing to wait for";
}

TEST_F(PlaylistChooser, DropsAnUpdateThatWasArmedBeforeTheSwitch) {
    chooseMorning();
    beginSync(10, 0.5);
    showChooser();
    postStatus();
    advance(updateDelay - instant);
    host_->journal.clear();

    tapRow(eveningRow);
    EXPECT_THAT(host_->journal.lines({"timer"}), ElementsAre("timer never"));
    drain(); // the choice announces itself, which arms an update anew
    EXPECT_THAT(host_->journal.lines({"timer"}), ElementsAre("timer never", "timer 1500000000"));

    advance(updateDelay - instant);
    EXPECT_EQ(reloads(), 0U) << "the one that was armed first would have come by now";
    advance(instant);
    EXPECT_EQ(reloads(), 1U);
}

// When it is reloaded.

TEST_F(PlaylistChooser, ReloadsAtOnceWhenTheLibraryChanges) {
    showChooser();
    host_->journal.clear();
    host_->mediaLibrary().addPlaylist(3, "New");

    changeLibrary();
    EXPECT_EQ(reloads(), 1U);
    draw();

    EXPECT_THAT(titles(), ElementsAre("Morning", "Evening", "New", "None"));
}

TEST_F(PlaylistChooser, ReloadsOnceForABurstOfStatusChanges) {
    showChooser();
    host_->journal.clear();

    for (int change = 0; change < 10; ++change) {
        postStatus();
    }
    advance(updateDelay - instant);
    EXPECT_EQ(reloads(), 0U);
    advance(instant);
    EXPECT_EQ(reloads(), 1U);

    advance(longAfter);
    EXPECT_EQ(reloads(), 1U);
    EXPECT_EQ(host_->journal.lines({"query"}).size(), 1U);
}

TEST_F(PlaylistChooser, DoesNotPushAnUpdateBackForLaterStatusChanges) {
    showChooser();
    host_->journal.clear();

    postStatus();
    advance(updateDelay / 2);
    postStatus();
    advance(updateDelay / 2);
    EXPECT_EQ(reloads(), 1U);

    advance(longAfter);
    EXPECT_EQ(reloads(), 1U);
}

TEST_F(PlaylistChooser, ReloadsAgainForAStatusChangeAfterTheUpdate) {
    showChooser();
    host_->journal.clear();
    postStatus();
    advance(updateDelay);
    ASSERT_EQ(reloads(), 1U);

    postStatus();
    advance(updateDelay);

    EXPECT_EQ(reloads(), 2U);
}

TEST_F(PlaylistChooser, ReloadsForTheStatusOfAnySender) {
    showChooser();
    host_->journal.clear();

    post(LMQuorlSyncStatusDidChangeNotification);
    advance(updateDelay);

    EXPECT_EQ(reloads(), 1U);
}

TEST_F(PlaylistChooser, ReloadsForTheStatusAlsoWhileItIsHidden) {
    showChooser();
    table_->viewWillDisappear(false);
    table_->viewDidDisappear(false);
    host_->journal.clear();

    postStatus();
    advance(updateDelay);

    EXPECT_EQ(reloads(), 1U);
}

TEST_F(PlaylistChooser, ReloadsAtOnceWhenAnotherPlaylistWasSentInFull) {
    showChooser();
    host_->journal.clear();

    const std::vector<std::optional<std::uint64_t>> sent{7, 8, 0x1'0000'0008, std::nullopt, 0};
    for (std::size_t change = 0; change < sent.size(); ++change) {
        store(SyncPreference::LastFullySentAssetSyncPlaylistPersistentID, sent[change]);
        post(LMSyncPreferencesDidChangeNotification);
        EXPECT_EQ(reloads(), change + 1);
    }
}

TEST_F(PlaylistChooser, DoesNotReloadForOtherPreferences) {
    store(SyncPreference::LastFullySentAssetSyncPlaylistPersistentID, 7);
    showChooser();
    host_->journal.clear();

    store(SyncPreference::AssetSyncEnabled, 1);
    store(SyncPreference::AssetSyncLimit, 5);
    store(SyncPreference::LastFullySentAssetSyncPlaylistVersion, 5);
    post(LMSyncPreferencesDidChangeNotification);

    EXPECT_EQ(reloads(), 0U);
}

TEST_F(PlaylistChooser, DoesNotReloadWhereNothingWasSentBeforeAndAfter) {
    showChooser();
    host_->journal.clear();

    post(LMSyncPreferencesDidChangeNotification);

    EXPECT_EQ(reloads(), 0U);
}

TEST_F(PlaylistChooser, ThatHasGoneIsNotUpdatedAnyMore) {
    showChooser();
    postStatus();
    const std::weak_ptr<UITableViewController> watched = table_;
    host_->journal.clear();

    table_.reset();
    EXPECT_TRUE(watched.expired()) << "the armed timer does not hold it";
    EXPECT_EQ(host_->journal.count("leave"), 1U);
    advance(longAfter);
    changeLibrary();

    EXPECT_THAT(host_->journal.lines({"query", "table", "text"}), IsEmpty());
}

TEST_F(PlaylistChooser, GoesWithoutATimerToo) {
    auto chooser = create<LMQuorlPlaylistChooser>();
    const std::weak_ptr<LMQuorlPlaylistChooser> watched = chooser;
    chooser.reset();
    EXPECT_TRUE(watched.expired());
    drain();
}

TEST_F(PlaylistChooser, HandsWhatItIsAskedToShowToItsParent) {
    showChooser();
    expectForwardingToParent();
}

TEST_F(PlaylistChooser, KeepsItsRowAndKnowsItsParentAndRootWithoutOwningThem) {
    showChooser();
    expectAccessors();
}

TEST_F(PlaylistChooser, DoesNothingForWhatHappensToTheDevice) {
    showChooser();
    expectNothingForTheDevice();
}

TEST_F(PlaylistChooser, LooksItsTextsUpAtEachUse) {
    chooseMorning();
    sendMorning();
    showChooser();

    host_->texts["SYNC_SETTINGS_PLAYLIST_SYNC_STATUS_SYNCED"] = "Done";
    host_->texts["SYNC_SETTINGS_PLAYLIST_PICKER_NONE"] = "Nothing";
    changeLibrary();
    draw();

    EXPECT_EQ(status(morningRow), "Done");
    EXPECT_THAT(titles(), ElementsAre("Morning", "Evening", "Nothing"));
}

} // namespace
