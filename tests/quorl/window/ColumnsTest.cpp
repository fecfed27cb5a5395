#include <QAccessible>
#include <QApplication>
#include <QScrollBar>
#include <QTest>
#include <QToolButton>

#include <gmock/gmock.h>

#include "tests/engine/client/WatchedEngine.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

constexpr int patience = 60'000; // milliseconds
constexpr QSize wide(PageColumns::widthForTwo, 600);
constexpr QSize narrow(PageColumns::widthForTwo - 1, 600);

class Columns : public testing::Test {
  protected:
    Columns() {
        window_.widget().activateWindow();
        resizeTo(wide);
    }

    void resizeTo(QSize size) {
        window_.widget().resize(size);
        QCoreApplication::processEvents();
    }

    [[nodiscard]] RowsView& front() { return *window_.widget().frontView(); }

    /// The place of a view in the window.
    [[nodiscard]] static QRect placeOf(const RowsView& view) {
        return {view.mapTo(view.window(), QPoint()), view.size()};
    }

    /// The row of the front page that says this; nothing for none.
    [[nodiscard]] std::optional<NSInteger> frontRow(const std::string& title) {
        for (NSInteger row = 0; row < front().content().rowCount(); ++row) {
            if (front().content().cell(row)->textLabel().text() == title) {
                return row;
            }
        }
        return std::nullopt;
    }

    void clickFront(const std::string& title) {
        const auto place =
            front().onViewport(front().layout().rowRect(frontRow(title).value())).center();
        QTest::mouseClick(front().viewport(), Qt::LeftButton, Qt::NoModifier, place.toPoint());
        QCoreApplication::processEvents();
    }

    [[nodiscard]] bool offersBack() {
        return !window_.widget().findChild<QToolButton*>(QStringLiteral("back"))->isHidden();
    }

    Window window_;
};

TEST_F(Columns, frontPageStandsBesideThePane) {
    EXPECT_EQ(window_.title(), "Music");
    EXPECT_TRUE(front().isVisible());
    EXPECT_TRUE(window_.view().isVisible());
    EXPECT_EQ(placeOf(front()).left(), 0);
    EXPECT_EQ(placeOf(front()).right() + 1, placeOf(window_.view()).left());
    EXPECT_EQ(placeOf(window_.view()).right() + 1, wide.width());
    EXPECT_EQ(placeOf(front()).height(), placeOf(window_.view()).height());
}

TEST_F(Columns, oneStandsAboveTheOtherInANarrowWindow) {
    resizeTo(narrow);
    EXPECT_FALSE(front().isVisible());
    EXPECT_EQ(placeOf(window_.view()).width(), narrow.width());
    EXPECT_TRUE(offersBack());
    window_.pressWithFocus(Qt::Key_Escape);
    EXPECT_EQ(window_.title(), "Velora");
    EXPECT_EQ(placeOf(front()).width(), narrow.width());
}

TEST_F(Columns, areMirroredForLanguagesThatAreReadFromTheRight) {
    QApplication::setLayoutDirection(Qt::RightToLeft);
    QCoreApplication::processEvents();
    EXPECT_EQ(placeOf(window_.view()).left(), 0);
    EXPECT_EQ(placeOf(window_.view()).right() + 1, placeOf(front()).left());
    QApplication::setLayoutDirection(Qt::LeftToRight);
}

TEST_F(Columns, rowThatIsOpenIsMarkedForEyesAndEars) {
    auto* list = QAccessible::queryAccessibleInterface(&front());
    const auto stateOf = [&](const std::string& title) {
        return list->child(front().layout().lineOfRow(frontRow(title).value()))->state();
    };
    EXPECT_EQ(front().markedRow(), frontRow("Music"));
    EXPECT_TRUE(stateOf("Music").selected);
    const auto place = front().onViewport(front().layout().rowRect(frontRow("Music").value()));
    const auto ground = [&] {
        return front().viewport()->grab().toImage().pixelColor(place.topLeft().toPoint() +
                                                               QPoint(8, 12));
    };
    const auto marked = ground();

    resizeTo(narrow);
    EXPECT_EQ(front().markedRow(), std::nullopt);
    EXPECT_FALSE(stateOf("Music").selected);
    resizeTo(wide);
    EXPECT_EQ(ground(), marked);
    EXPECT_NE(marked, PaneColors::of(front().palette(), window_.screen().look()).card);
}

TEST_F(Columns, crossingTheWidthKeepsPanePlaceAndFocus) {
    window_.click(1);
    ASSERT_EQ(window_.title(), "Playlist Limit");
    resizeTo({wide.width(), 300});
    window_.view().verticalScrollBar()->setValue(60);
    auto* const view = &window_.view();
    ASSERT_EQ(QApplication::focusWidget(), view);
    for (const int width : {narrow.width(), wide.width()}) {
        resizeTo({width, 300});
        EXPECT_EQ(&window_.view(), view);
        EXPECT_EQ(view->verticalScrollBar()->value(), 60);
        EXPECT_EQ(QApplication::focusWidget(), view);
    }
}

TEST_F(Columns, focusOfAColumnThatGoesIsOnThePane) {
    front().setFocus();
    resizeTo(narrow);
    EXPECT_EQ(QApplication::focusWidget(), &window_.view());
}

TEST_F(Columns, stepBackIsOfferedFromTheSecondPaneOn) {
    EXPECT_FALSE(offersBack());
    window_.pressWithFocus(Qt::Key_Escape);
    EXPECT_EQ(window_.title(), "Music");

    window_.click(1);
    EXPECT_TRUE(offersBack());
    window_.pressWithFocus(Qt::Key_Escape);
    EXPECT_EQ(window_.title(), "Music");
    EXPECT_FALSE(offersBack());
}

TEST_F(Columns, rowOfTheFrontPageReturnsToWhatItHasOpened) {
    const auto music = window_.companion().navigation().top();
    window_.click(1);
    clickFront("Music");
    EXPECT_EQ(window_.companion().navigation().top(), music);
    clickFront("Music");
    EXPECT_EQ(window_.companion().navigation().top(), music);
}

TEST_F(Columns, anotherRowOfTheFrontPageTakesTheSecondOne) {
    const syncd::testing::WatchedEngine engine;
    ASSERT_TRUE(QTest::qWaitFor([this] { return frontRow("Sync").has_value(); }, patience))
        << "the page tells what there is while it stands beside another";

    clickFront("Sync");

    EXPECT_EQ(window_.title(), "Sync");
    EXPECT_EQ(window_.companion().navigation().stack().size(), 2);
    EXPECT_EQ(front().markedRow(), frontRow("Sync"));
    EXPECT_FALSE(offersBack());
}

TEST_F(Columns, keysGoFromOneToTheOther) {
    ASSERT_EQ(QApplication::focusWidget(), &window_.view());
    window_.pressWithFocus(Qt::Key_F6);
    EXPECT_EQ(QApplication::focusWidget(), &front());
    window_.pressWithFocus(Qt::Key_Tab);
    EXPECT_EQ(QApplication::focusWidget(), &window_.view());
    window_.pressWithFocus(Qt::Key_Backtab, Qt::ShiftModifier);
    EXPECT_EQ(QApplication::focusWidget(), &front());
    window_.pressWithFocus(Qt::Key_F6);
    EXPECT_EQ(QApplication::focusWidget(), &window_.view());
    resizeTo(narrow);
    window_.pressWithFocus(Qt::Key_F6);
    EXPECT_EQ(QApplication::focusWidget(), &window_.view());
}

TEST_F(Columns, onlyTheColumnThatChangesSlides) {
    Look look = window_.screen().look();
    look.motion = Motion::Full;
    window_.screen().setLook(look);
    window_.click(1);
    auto& slide = *window_.widget().findChild<PageSlide*>();
    ASSERT_TRUE(slide.isRunning());
    EXPECT_EQ(QRect(slide.mapTo(&window_.widget(), QPoint()), slide.size()),
              placeOf(window_.view()));
}

TEST_F(Columns, secondOneHasTheMusicPaneWhereNothingWasOpen) {
    resizeTo(narrow);
    window_.pressWithFocus(Qt::Key_Escape);
    ASSERT_EQ(window_.title(), "Velora");
    resizeTo(wide);
    EXPECT_EQ(window_.title(), "Music");
    EXPECT_LE(placeOf(front()).right(), placeOf(window_.view()).left());
    EXPECT_EQ(front().markedRow(), frontRow("Music"));
}

TEST_F(Columns, secondOneHasTheMusicPaneAlsoWhereTheWindowWasWidenedUnseen) {
    resizeTo(narrow);
    window_.pressWithFocus(Qt::Key_Escape);
    window_.widget().hide();
    resizeTo(wide);
    window_.widget().show();
    QCoreApplication::processEvents();
    EXPECT_EQ(window_.title(), "Music");
    EXPECT_EQ(front().markedRow(), frontRow("Music"));
}

} // namespace

} // namespace quorl::tests
