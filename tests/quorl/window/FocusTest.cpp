#include <QApplication>
#include <QTest>

#include <gmock/gmock.h>

#include "tests/quorl/window/Finger.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

/// Whether anything has the tint where the ring of the current row is, and nowhere else a row has
/// it at its upper edge.
bool showsRing(Window& window) {
    const auto row = window.view().currentRow();
    const QRectF place = window.view().onViewport(window.view().layout().rowRect(row.value_or(0)));
    const QImage picture = window.view().viewport()->grab().toImage();
    const QPoint edge = (place.topLeft() + QPointF(place.width() / 2, 2)).toPoint();
    const auto colors = PaneColors::of(window.view().palette(), window.screen().look());
    return picture.pixelColor(edge).rgb() == colors.tint.rgb();
}

TEST(Focus, keysWorkAfterEveryStepBack) {
    Window window;
    window.widget().activateWindow();
    window.pressWithFocus(Qt::Key_End);
    window.pressWithFocus(Qt::Key_Return);
    ASSERT_EQ(window.title(), "Playlist Limit");
    window.pressWithFocus(Qt::Key_Escape);
    ASSERT_EQ(window.title(), "Music");
    EXPECT_EQ(QApplication::focusWidget(), &window.view());
    window.pressWithFocus(Qt::Key_Home);
    window.pressWithFocus(Qt::Key_Return);
    EXPECT_EQ(window.title(), "Synced Playlist");
}

TEST(Focus, isOnTheCheckedRowOfAPaneThatOpens) {
    Window window;
    window.click(0);
    ASSERT_EQ(window.view().currentRow(), 2);
    EXPECT_EQ(window.rows()[2], "✓ None");
}

TEST(Focus, isOnTheRowOfThePaneThatWasOpenFromTheStart) {
    Window window;
    window.pressWithFocus(Qt::Key_Escape);
    ASSERT_EQ(window.title(), "Velora");
    EXPECT_TRUE(window.view().hasFocus());
    window.pressWithFocus(Qt::Key_Return);
    EXPECT_EQ(window.title(), "Music");
}

TEST(Focus, isOnTheRowThatWasEnteredAfterStepBack) {
    Window window;
    window.click(1);
    window.pressWithFocus(Qt::Key_Escape);
    ASSERT_EQ(window.title(), "Music");
    EXPECT_EQ(window.view().currentRow(), 1);
    window.pressWithFocus(Qt::Key_Return);
    EXPECT_EQ(window.title(), "Playlist Limit");
}

TEST(Focus, ringIsSeenOnceKeysAreUsed) {
    Window window;
    window.widget().activateWindow();
    EXPECT_FALSE(showsRing(window));
    window.pressWithFocus(Qt::Key_Down);
    EXPECT_TRUE(showsRing(window));
}

TEST(Focus, ringStaysThroughPanesAsLongAsKeysAreUsed) {
    Window window;
    window.widget().activateWindow();
    window.pressWithFocus(Qt::Key_End);
    window.pressWithFocus(Qt::Key_Return);
    ASSERT_EQ(window.title(), "Playlist Limit");
    EXPECT_TRUE(showsRing(window));
    window.pressWithFocus(Qt::Key_Escape);
    EXPECT_TRUE(showsRing(window));
}

TEST(Focus, ringGoesWithAClickOrATouch) {
    Window window;
    window.widget().activateWindow();
    window.pressWithFocus(Qt::Key_Down);
    ASSERT_TRUE(showsRing(window));
    window.click(1);
    EXPECT_FALSE(showsRing(window));
    window.pressWithFocus(Qt::Key_Down);
    ASSERT_TRUE(showsRing(window));
    Finger().tap(*window.view().viewport(), QPoint(4, 600));
    EXPECT_FALSE(showsRing(window));
}

} // namespace

} // namespace quorl::tests
