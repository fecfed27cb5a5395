#include <QContextMenuEvent>
#include <QGuiApplication>
#include <QMenu>
#include <QStyleHints>
#include <QTest>

#include <gmock/gmock.h>

#include "tests/quorl/window/Finger.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

/// What stands in the menu that is open, from top to bottom; nothing where none is.
std::vector<std::string> linesOfMenu(Window& window) {
    std::vector<std::string> lines;
    for (const auto* menu : window.widget().findChildren<QMenu*>()) {
        for (const auto* action : menu->isVisible() ? menu->actions() : QList<QAction*>()) {
            lines.push_back(action->text().toStdString());
        }
    }
    return lines;
}

QPoint middleOf(Window& window, NSInteger row) {
    return window.view().onViewport(window.view().layout().rowRect(row)).center().toPoint();
}

void rightClick(Window& window, NSInteger row) {
    const auto place = middleOf(window, row);
    QContextMenuEvent event(QContextMenuEvent::Mouse, place,
                            window.view().viewport()->mapToGlobal(place));
    QCoreApplication::sendEvent(window.view().viewport(), &event);
}

TEST(Context, saysWhatThereIsToKnowOfAPlaylistBeforeItIsChosen) {
    Window window;
    window.click(0);
    rightClick(window, 0);
    EXPECT_THAT(linesOfMenu(window), ElementsAre("3 songs, 3 MB", "All of it is within the limit",
                                                 "Long Run.m3u8", "Open Its Folder"));
    EXPECT_EQ(window.rows().filter("✓"), QStringList{"✓ None"}) << "nothing was chosen";
}

TEST(Context, isAskedForByTheMenuKey) {
    Window window;
    window.click(0);
    window.press(Qt::Key_Home);
    QContextMenuEvent event(QContextMenuEvent::Keyboard, {}, {});
    QCoreApplication::sendEvent(window.view().viewport(), &event);
    EXPECT_EQ(linesOfMenu(window).size(), 4);
}

TEST(Context, isAskedForByALongPressWhichChoosesNothing) {
    Window window;
    window.click(0);
    QGuiApplication::styleHints()->setMousePressAndHoldInterval(1);
    Finger finger;
    finger.press(*window.view().viewport(), middleOf(window, 0));
    EXPECT_TRUE(QTest::qWaitFor([&] { return !linesOfMenu(window).empty(); }, 60'000));
    finger.release(*window.view().viewport(), middleOf(window, 0));
    EXPECT_EQ(window.rows().filter("✓"), QStringList{"✓ None"});
}

TEST(Context, isNoneOfRowsThatAreNoPlaylists) {
    Window window;
    rightClick(window, 0);
    EXPECT_THAT(linesOfMenu(window), IsEmpty());
    window.click(0);
    rightClick(window, 2);
    EXPECT_THAT(linesOfMenu(window), IsEmpty()) << "None is no playlist";
}

} // namespace

} // namespace quorl::tests
