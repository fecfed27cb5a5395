#include <QCoreApplication>

#include <gmock/gmock.h>

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
