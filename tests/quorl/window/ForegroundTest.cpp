#include <QCoreApplication>

#include <gmock/gmock.h>

#include "platform/SyncPreferences.h"
#include "tests/quorl/StoredPreferences.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

/// Notes what the host tells of the app.
class Listener : public NSObject {
  public:
    bool init() override {
        for (const auto name : {UIApplicationDidEnterBackgroundNotification,
                                UIApplicationWillEnterForegroundNotification}) {
            NSNotificationCenter::defaultCenter().addObserver_selector_name_object(
                this, NSNotificationSelector::of<&Listener::note>("note:"), name, nullptr);
        }
        return NSObject::init();
    }

    ~Listener() override { NSNotificationCenter::defaultCenter().removeObserver(this); }

    void note(const NSNotification& notification) { names.push_back(notification.name); }

    std::vector<NSNotificationName> names;
};

/// Notes when it comes on the screen and leaves it.
class Pane : public PSListController {
  public:
    NSArray<PSSpecifier> specifiers() override { return nullptr; }

    void viewWillAppear(bool animated) override {
        PSListController::viewWillAppear(animated);
        calls->emplace_back("appears");
    }

    void viewDidDisappear(bool animated) override {
        PSListController::viewDidDisappear(animated);
        calls->emplace_back("disappears");
    }

    std::vector<std::string>* calls = nullptr;
};

TEST(Foreground, minimisedWindowIsInTheBackgroundUntilItComesBack) {
    Window window;
    const auto listener = create<Listener>();
    window.widget().showMinimized();
    EXPECT_THAT(listener->names, testing::ElementsAre(UIApplicationDidEnterBackgroundNotification));
    window.widget().showNormal();
    EXPECT_THAT(listener->names,
                testing::ElementsAre(UIApplicationDidEnterBackgroundNotification,
                                     UIApplicationWillEnterForegroundNotification));
}

TEST(Foreground, hiddenWindowIsInTheBackgroundUntilItIsShown) {
    Window window;
    const auto listener = create<Listener>();
    window.widget().hide();
    window.widget().show();
    EXPECT_THAT(listener->names,
                testing::ElementsAre(UIApplicationDidEnterBackgroundNotification,
                                     UIApplicationWillEnterForegroundNotification));
}

TEST(Foreground, paneShowsHowThingsStandWhenTheWindowComesBack) {
    Window window;
    window.press(Qt::Key_End);
    window.press(Qt::Key_Return);
    ASSERT_TRUE(window.waitForRow("✓ 500 MB"));
    window.widget().showMinimized();
    storePreference("asset-sync-limit", "1024");
    window.widget().showNormal();
    EXPECT_TRUE(window.waitForRow("✓ 1 GB"));
    EXPECT_THAT(window.rows(), testing::Not(testing::Contains("✓ 500 MB")));
}

TEST(Foreground, panesReadWhatAnotherProgramHasStoredThoughItIsNotAnnouncedYet) {
    Window window;
    window.widget().showMinimized();
    storePreference("asset-sync-limit", "1024");
    window.widget().showNormal();
    const auto limit = LMSyncDefaults::sharedDefaults().assetSyncLimit();
    ASSERT_NE(limit, nullptr);
    EXPECT_EQ(limit->unsignedLongLongValue(), 1024);
}

TEST(Foreground, paneIsTakenOffTheScreenOnceWhereTheWindowIsClosedInTheBackground) {
    std::vector<std::string> calls;
    {
        Window window;
        const auto pane = create<Pane>();
        pane->calls = &calls;
        window.companion().navigation().pushController_animated(pane, false);
        window.widget().showMinimized();
    }
    EXPECT_THAT(calls, testing::ElementsAre("appears", "disappears"));
}

TEST(Foreground, anotherWindowInFrontIsNoBackground) {
    Window window;
    const auto listener = create<Listener>();
    QWidget other;
    other.show();
    other.activateWindow();
    QCoreApplication::processEvents();
    EXPECT_THAT(listener->names, testing::IsEmpty());
}

} // namespace

} // namespace quorl::tests
