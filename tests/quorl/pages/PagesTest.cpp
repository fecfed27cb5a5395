#include <gmock/gmock.h>

#include "quorl/pages/FrontPage.h"
#include "quorl/pages/LeftOutPage.h"
#include "quorl/pages/SyncPage.h"
#include "tests/quorl/pages/ShownPage.h"

namespace quorl::tests {

namespace {

using testing::AllOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;

/// A session that has brought one of four songs.
engine::SessionState session() {
    engine::SessionState session;
    session.path = "/1";
    session.isProgressValid = true;
    session.progress = engine::Fraction(0.25);
    session.bytes = 400;
    session.rate = 1;
    session.currentItem = "b/Two.mp3";
    engine::TaskState task;
    task.groupingKey = engine::assetGroupingKey;
    task.totalItemCount = 4;
    task.completedItemCount = 1;
    session.tasks = {task};
    return session;
}

class Pages : public ShownPage {
  protected:
    /// Opens the page from the front page, or the front page itself.
    template <class Page>
    void open() {
        show(FrontPage::over(services_, Class::of<LeftOutPage>(), "Music"));
        if constexpr (!std::is_same_v<Page, FrontPage>) {
            navigation_->open(PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
                "a page", nullptr, {}, {}, Class::of<Page>(), PSCellType::LinkList, {}));
        }
    }
};

TEST_F(Pages, frontSaysOneSentence) {
    services_.state.engine.status = "The wearable is not on its charger.";
    services_.state.engine.lastMessage = "Syncing was cancelled.";
    open<FrontPage>();
    EXPECT_THAT(text(), AllOf(HasSubstr("      The wearable is not on its charger.\n"),
                              Not(HasSubstr("cancelled"))));
}

TEST_F(Pages, frontTellsTheLastCompleteSyncAndNoOther) {
    services_.state.engine.lastTime = 1'000'000'000'000'000;
    open<FrontPage>();
    EXPECT_THAT(text(), HasSubstr("Last Complete Sync: Not yet\n"));
    services_.state.engine.lastComplete = 1'000'000'000'000'000;
    EXPECT_THAT(text(), HasSubstr("2001"));
}

TEST_F(Pages, frontCallsAPretenceAPretence) {
    open<FrontPage>();
    EXPECT_THAT(text(), AllOf(HasSubstr("Connection: On this device (for trying out)\n"),
                              HasSubstr("Simulated Charger: off\n")));
    tap("Simulated Charger");
    EXPECT_THAT(text(), HasSubstr("Simulated Charger: on\n"));

    services_.state.wearable.isEmbedded = false;
    EXPECT_THAT(text(), AllOf(HasSubstr("Connection: Connected\n"),
                              HasSubstr("Charger: On its charger\n")));
    services_.state.wearable.isConnected = false;
    EXPECT_THAT(text(), HasSubstr("Connection: Not connected\n"));
}

TEST_F(Pages, frontSaysNothingOfAWearableWhereThereIsNoEngine) {
    services_.state = {};
    open<FrontPage>();
    EXPECT_THAT(text(), AllOf(HasSubstr("The sync engine is not running"),
                              HasSubstr("  1  Music\n"), Not(HasSubstr("Storage"))));
}

TEST_F(Pages, frontOpensFurtherPanesAndSaysWhyOneIsNotThere) {
    services_.state = {};
    const auto page = FrontPage::over(services_, Class::of<LeftOutPage>(), "Music");
    page->addPane(Class::of<SyncPage>(), "Alarm");
    page->addProblem("A plug-in cannot be shown.");
    show(page);
    EXPECT_THAT(text(), AllOf(HasSubstr("  1  Music\n  2  Alarm\n"),
                              HasSubstr("A plug-in cannot be shown.\n")));
    tap("Alarm");
    EXPECT_EQ(navigation_->top()->title(), "Sync");
}

TEST_F(Pages, syncShowsWhatIsUnderWay) {
    services_.state.sessions = {session()};
    services_.state.engine.playlistName = "Road Trip";
    open<SyncPage>();
    EXPECT_THAT(text(), AllOf(HasSubstr("Road Trip\n  1  Progress: Song 2 of 4, 25%\n"
                                        "  2  Time Left: About 5 minutes\n"
                                        "  3  Now: Two\n"
                                        "  4  [Stop]\n")));
    EXPECT_EQ(SyncPage::summaryOf(services_.state), "25%");
    tap("Stop");
    EXPECT_THAT(services_.requests, ElementsAre(&engine::Client::cancel));
}

TEST_F(Pages, syncOffersToBeginWhereThereIsSomethingToSync) {
    services_.state.engine.syncState = engine::syncPending;
    open<SyncPage>();
    tap("Sync Now");
    EXPECT_THAT(services_.requests, ElementsAre(&engine::Client::startNow));
    services_.state.engine.syncState = engine::syncOff;
    EXPECT_THAT(text(), Not(HasSubstr("Sync Now")));
}

TEST_F(Pages, rowThatIsNotThereAnyMoreCannotBeTapped) {
    services_.state.engine.syncState = engine::syncPending;
    open<SyncPage>();
    static_cast<void>(text());
    services_.state.sessions = {session()};
    refresh();
    EXPECT_FALSE(content_->tap(0));
    EXPECT_TRUE(services_.requests.empty());
}

TEST_F(Pages, syncCountsWhatIsThereAndWhatIsNot) {
    services_.state.wearable.songCount = 1;
    services_.state.wearable.songs = 3'300'000;
    services_.state.engine.leftOutCount = 3;
    services_.state.engine.beyondLimit = 12;
    open<SyncPage>();
    EXPECT_THAT(text(), AllOf(HasSubstr("On the Velora\n"), HasSubstr("Music: 1 song, 3.1 MB\n"),
                              HasSubstr("Could Not Be Sent: 3 songs\n"),
                              HasSubstr("Beyond the Limit: 12 songs\n")));
}

TEST_F(Pages, syncSwitchesTheStartAtLogin) {
    open<SyncPage>();
    EXPECT_THAT(text(), HasSubstr("Start at Login: off\n"));
    tap("Start at Login");
    EXPECT_THAT(text(), HasSubstr("Start at Login: on\n"));
}

TEST_F(Pages, syncOffersNoStartAtLoginWhereThereIsNone) {
    services_.isLoginStart.reset();
    open<SyncPage>();
    EXPECT_THAT(text(), Not(HasSubstr("Start at Login")));
}

TEST_F(Pages, syncAsksForTheStartAtLoginOnceForAllThatIsToldWhileItIsShown) {
    open<SyncPage>();
    for (int news = 0; news < 10; ++news) {
        refresh();
    }
    EXPECT_EQ(services_.loginStartReads, 1);
}

TEST_F(Pages, syncSwitchesNotificationsButNotForATrial) {
    open<SyncPage>();
    EXPECT_THAT(text(), HasSubstr("Notifications: on\n"));
    tap("Notifications");
    EXPECT_EQ(services_.hasNotices, false);
    EXPECT_THAT(text(), HasSubstr("Notifications: off\n"));
    services_.hasNotices.reset();
    EXPECT_THAT(text(), Not(HasSubstr("Notifications")));
}

TEST_F(Pages, whatCouldNotBeSentIsListedUnderItsReason) {
    services_.state.engine.leftOut = {{"gone.mp3", "missing"}, {"a/note.txt", "not-music"}};
    services_.state.engine.leftOutCount = 5;
    open<SyncPage>();
    tap("Could Not Be Sent");
    const std::string missing(media::sentence(media::Reason::Missing));
    EXPECT_THAT(text(), AllOf(HasSubstr("  gone.mp3\n"), HasSubstr("  a/note.txt\n"),
                              HasSubstr(missing.substr(0, 20)), HasSubstr("And 3 more.\n")));
}

TEST_F(Pages, musicIsRemovedOnlyAfterAQuestion) {
    services_.state.wearable.songCount = 3;
    open<SyncPage>();
    tap("Remove Music");
    EXPECT_TRUE(services_.requests.empty());
    EXPECT_THAT(text(), HasSubstr("All other files on the Velora stay"));
    tap("Remove All Synced Music");
    EXPECT_THAT(services_.requests, ElementsAre(&engine::Client::removeMusic));
    services_.state.wearable.songCount = 0;
    EXPECT_THAT(text(), HasSubstr("There is no synced music on the Velora."));
}

} // namespace

} // namespace quorl::tests
