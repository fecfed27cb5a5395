#include <QScrollBar>
#include <QScroller>
#include <QTest>
#include <QWheelEvent>

#include <gmock/gmock.h>

#include "tests/quorl/window/Finger.h"
#include "tests/quorl/window/ShownTable.h"

namespace quorl::tests {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

/// A long table under a finger.
class MovingRows : public testing::Test {
  protected:
    /// A finger flicks the rows and leaves them moving.
    void flick() {
        QScroller& scroller = *QScroller::scroller(shown_.view().viewport());
        scroller.handleInput(QScroller::InputPress, QPointF(100, 600), 0);
        for (int step = 1; step <= 5; ++step) {
            scroller.handleInput(QScroller::InputMove, QPointF(100, 600 - 80 * step), 10 * step);
        }
        scroller.handleInput(QScroller::InputRelease, QPointF(100, 200), 51);
        ASSERT_EQ(scroller.state(), QScroller::Scrolling);
    }

    void touch() { finger_.tap(*shown_.view().viewport(), place); }

    void wheel(Qt::ScrollPhase phase) {
        QWheelEvent event(QPointF(place), shown_.view().viewport()->mapToGlobal(QPointF(place)),
                          QPoint(0, -60), QPoint(0, -60), Qt::NoButton, Qt::NoModifier, phase,
                          false);
        QCoreApplication::sendEvent(shown_.view().viewport(), &event);
    }

    void click() {
        QTest::mouseClick(shown_.view().viewport(), Qt::LeftButton, Qt::NoModifier, place);
    }

    /// The second half of a double click.
    void doubleClick() {
        const QPointF there = place;
        for (const auto type : {QEvent::MouseButtonDblClick, QEvent::MouseButtonRelease}) {
            QMouseEvent event(type, there, shown_.view().viewport()->mapToGlobal(there),
                              Qt::LeftButton, Qt::LeftButton, Qt::NoModifier);
            QCoreApplication::sendEvent(shown_.view().viewport(), &event);
        }
    }

    [[nodiscard]] std::string nameUnderFinger() {
        const auto row = shown_.view().layout().rowAt(shown_.view().onPane(place));
        return row ? *shown_.view().content().cell(*row)->textLabel().text() : "none";
    }

    static constexpr QPoint place = QPoint(100, 300);

    ShownTable shown_ = ShownTable(manyNames(1000), "nobody");
    Finger finger_;
};

TEST_F(MovingRows, touchThatStopsThemChoosesNothing) {
    flick();
    touch();
    EXPECT_NE(QScroller::scroller(shown_.view().viewport())->state(), QScroller::Scrolling);
    EXPECT_THAT(shown_.table().selected, IsEmpty());
}

TEST_F(MovingRows, nextTouchChoosesTheRowUnderTheFinger) {
    flick();
    touch();
    const std::string name = nameUnderFinger();
    touch();
    EXPECT_THAT(shown_.table().selected, ElementsAre(name));
}

TEST_F(MovingRows, touchOnRowsAtRestChooses) {
    const std::string name = nameUnderFinger();
    touch();
    EXPECT_THAT(shown_.table().selected, ElementsAre(name));
}

TEST_F(MovingRows, everyOneOfQuickTouchesChooses) {
    const std::string name = nameUnderFinger();
    touch();
    touch();
    touch();
    EXPECT_THAT(shown_.table().selected, ElementsAre(name, name, name));
}

TEST_F(MovingRows, fingerThatDragsThemPressesNoRow) {
    finger_.press(*shown_.view().viewport(), place);
    QScroller::scroller(shown_.view().viewport())
        ->handleInput(QScroller::InputMove, QPointF(place) + QPointF(0, 90), 1'000'000);
    finger_.release(*shown_.view().viewport(), place + QPoint(0, 90));
    EXPECT_THAT(shown_.table().selected, IsEmpty());
}

TEST_F(MovingRows, clickThatStopsThemChoosesNothing) {
    flick();
    click();
    EXPECT_NE(QScroller::scroller(shown_.view().viewport())->state(), QScroller::Scrolling);
    EXPECT_THAT(shown_.table().selected, IsEmpty());
    const std::string name = nameUnderFinger();
    click();
    EXPECT_THAT(shown_.table().selected, ElementsAre(name));
}

TEST_F(MovingRows, secondOfTwoQuickClicksChoosesToo) {
    const std::string name = nameUnderFinger();
    click();
    doubleClick();
    EXPECT_THAT(shown_.table().selected, ElementsAre(name, name));
}

TEST_F(MovingRows, doubleClickWhoseFirstHalfOpenedThePaneChoosesNothingInIt) {
    doubleClick();
    EXPECT_THAT(shown_.table().selected, IsEmpty());
}

TEST_F(MovingRows, keyStopsThem) {
    flick();
    shown_.press(Qt::Key_Down);
    EXPECT_EQ(QScroller::scroller(shown_.view().viewport())->state(), QScroller::Inactive);
}

TEST_F(MovingRows, pressWhileAWheelStillRollsOnlyStopsIt) {
    wheel(Qt::ScrollUpdate);
    wheel(Qt::ScrollMomentum);
    click();
    EXPECT_THAT(shown_.table().selected, IsEmpty());
    const int stopped = shown_.view().verticalScrollBar()->value();
    wheel(Qt::ScrollMomentum);
    EXPECT_EQ(shown_.view().verticalScrollBar()->value(), stopped);
    wheel(Qt::ScrollUpdate);
    EXPECT_NE(shown_.view().verticalScrollBar()->value(), stopped);
}

TEST_F(MovingRows, clickAfterAWheelThatDoesNotRollOnChooses) {
    wheel(Qt::NoScrollPhase);
    const std::string name = nameUnderFinger();
    click();
    EXPECT_THAT(shown_.table().selected, ElementsAre(name));
}

TEST_F(MovingRows, scrollBarIsSeenWhileTheyMoveAndCanBeDragged) {
    auto& bar = *shown_.view().findChild<OverlayScrollBar*>();
    EXPECT_FALSE(bar.isVisible());
    wheel(Qt::NoScrollPhase);
    ASSERT_TRUE(bar.isVisible());
    const QPoint from = bar.thumb().center().toPoint();
    QTest::mousePress(&bar, Qt::LeftButton, Qt::NoModifier, from);
    QTest::mouseMove(&bar, QPoint(from.x(), bar.height()));
    QTest::mouseRelease(&bar, Qt::LeftButton, Qt::NoModifier, QPoint(from.x(), bar.height()));
    EXPECT_EQ(shown_.view().verticalScrollBar()->value(),
              shown_.view().verticalScrollBar()->maximum());
    EXPECT_THAT(shown_.namesOnScreen(), testing::Contains("None"));
    EXPECT_TRUE(QTest::qWaitFor([&bar] { return !bar.isVisible(); }, 60'000));
}

} // namespace

} // namespace quorl::tests
