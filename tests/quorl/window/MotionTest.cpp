#include <QPaintEvent>
#include <QSignalSpy>
#include <QTest>

#include <gmock/gmock.h>

#include "quorl/window/PageSlide.h"
#include "tests/quorl/window/Finger.h"
#include "tests/quorl/window/ShownTable.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

constexpr int patience = 60'000; // milliseconds

void allowMotion(WindowScreen& screen) {
    Look look = screen.look();
    look.motion = Motion::Full;
    screen.setLook(look);
}

/// Notes what of a widget is painted.
class PaintWatch final : public QObject {
  public:
    explicit PaintWatch(QWidget& widget) {
        QCoreApplication::processEvents();
        widget.installEventFilter(this);
    }

    bool eventFilter(QObject* /*watched*/, QEvent* event) override {
        if (event->type() == QEvent::Paint) {
            painted += static_cast<QPaintEvent*>(event)->region();
        }
        return false;
    }

    QRegion painted;
};

TEST(Painting, onlyTheRowThatChangesIsPaintedAnew) {
    ShownTable shown(manyNames(8), "Name 1002");
    PaintWatch watch(*shown.view().viewport());
    shown.table().status = "Synced";
    shown.reloadWith(manyNames(8));
    QCoreApplication::processEvents();
    const QRect row = shown.view().onViewport(shown.view().layout().rowRect(2)).toRect();
    EXPECT_TRUE(watch.painted.contains(row.center()));
    EXPECT_LE(watch.painted.boundingRect().height(), row.height() + 4);
}

TEST(Painting, nothingIsPaintedWhereNothingChanges) {
    ShownTable shown(manyNames(8), "Name 1002");
    PaintWatch watch(*shown.view().viewport());
    shown.reloadWith(manyNames(8));
    QCoreApplication::processEvents();
    EXPECT_TRUE(watch.painted.isEmpty());
}

TEST(Painting, allIsPaintedWhereARowArrives) {
    ShownTable shown(manyNames(8), "Name 1002");
    PaintWatch watch(*shown.view().viewport());
    shown.reloadWith(manyNames(9));
    QCoreApplication::processEvents();
    EXPECT_EQ(watch.painted.boundingRect(), shown.view().viewport()->rect());
}

TEST(Painting, pointerPaintsTheRowsThatItLeavesAndEnters) {
    ShownTable shown(manyNames(8));
    const auto center = [&shown](NSInteger row) {
        return shown.view().onViewport(shown.view().layout().rowRect(row)).center();
    };
    const auto moveTo = [&shown](QPointF place) {
        QMouseEvent move(QEvent::MouseMove, place, shown.view().viewport()->mapToGlobal(place),
                         Qt::NoButton, Qt::NoButton, Qt::NoModifier);
        QCoreApplication::sendEvent(shown.view().viewport(), &move);
        QCoreApplication::processEvents();
    };
    moveTo(center(1));
    PaintWatch watch(*shown.view().viewport());
    moveTo(center(4));
    EXPECT_TRUE(watch.painted.contains(center(1).toPoint()));
    EXPECT_TRUE(watch.painted.contains(center(4).toPoint()));
    EXPECT_FALSE(watch.painted.contains(center(6).toPoint()));
    EXPECT_FALSE(watch.painted.contains(center(2).toPoint()));
}

TEST(Painting, fingerLeavesNoRowUnderThePointer) {
    ShownTable shown(manyNames(8));
    const QImage before = shown.view().viewport()->grab().toImage();
    Finger finger;
    finger.press(*shown.view().viewport(), QPoint(100, 100));
    EXPECT_NE(shown.view().viewport()->grab().toImage(), before);
    finger.release(*shown.view().viewport(), QPoint(100, 100));
    EXPECT_EQ(shown.view().viewport()->grab().toImage(), before);
}

TEST(Slide, paneSlidesInAndOutAndThenIsThere) {
    Window window;
    allowMotion(window.screen());
    auto& slide = *window.widget().findChild<PageSlide*>();
    window.click(1);
    EXPECT_TRUE(slide.isRunning());
    ASSERT_TRUE(QTest::qWaitFor([&slide] { return !slide.isVisible(); }, patience));
    EXPECT_EQ(window.title(), "Playlist Limit");
    window.pressWithFocus(Qt::Key_Escape);
    EXPECT_TRUE(slide.isRunning());
    ASSERT_TRUE(QTest::qWaitFor([&slide] { return !slide.isVisible(); }, patience));
    EXPECT_EQ(window.title(), "Music");
}

TEST(Slide, pageThatStaysIsNotPaintedForASlide) {
    Window window;
    allowMotion(window.screen());
    const PaintWatch watch(*window.view().viewport());
    QSignalSpy drawing(&window.screen(), &PaneScreen::drawing);
    window.screen().scheduleDrawing();
    ASSERT_TRUE(drawing.wait(patience));
    EXPECT_TRUE(watch.painted.isEmpty());
}

TEST(Slide, clickWhileItSlidesReachesNoRow) {
    Window window;
    allowMotion(window.screen());
    window.click(1);
    auto& slide = *window.widget().findChild<PageSlide*>();
    ASSERT_TRUE(slide.isRunning());
    EXPECT_EQ(window.widget().childAt(180, 200), &slide);
    QTest::mouseClick(&slide, Qt::LeftButton, Qt::NoModifier, QPoint(180, 200));
    EXPECT_THAT(window.rows(), testing::Contains("✓ 500 MB"));
}

TEST(Slide, nothingSlidesOrFadesWithReducedMotion) {
    Window window;
    window.click(1);
    EXPECT_FALSE(window.widget().findChild<PageSlide*>()->isVisible());
    EXPECT_EQ(window.title(), "Playlist Limit");
    window.click(0);
    const QImage after = window.view().viewport()->grab().toImage();
    QCoreApplication::processEvents();
    EXPECT_EQ(window.view().viewport()->grab().toImage(), after);
}

TEST(Slide, tappedRowFadesWithMotion) {
    ShownTable shown(manyNames(8));
    const QImage before = shown.view().viewport()->grab().toImage();
    allowMotion(shown.screen());
    shown.view().tap(1);
    EXPECT_NE(shown.view().viewport()->grab().toImage(), before);
    EXPECT_TRUE(QTest::qWaitFor([&] { return shown.view().viewport()->grab().toImage() == before; },
                                patience));
}

} // namespace

} // namespace quorl::tests
