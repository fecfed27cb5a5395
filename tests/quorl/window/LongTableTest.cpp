#include <QAccessible>
#include <QScrollBar>
#include <QTest>

#include <gmock/gmock.h>

#include "quorl/app/CompanionHost.h"
#include "quorl/window/rows/RowsView.h"

namespace quorl::tests {

namespace {

constexpr NSInteger length = 100'000;

class LongTable final : public UITableViewController {
  public:
    NSInteger numberOfSectionsInTableView(UITableView& /*tableView*/) override { return 1; }

    NSInteger tableView_numberOfRowsInSection(UITableView& /*tableView*/,
                                              NSInteger /*section*/) override {
        return rows;
    }

    std::shared_ptr<UITableViewCell>
    tableView_cellForRowAtIndexPath(UITableView& tableView, const NSIndexPath& path) override {
        auto cell = tableView.dequeueReusableCellWithIdentifier("row");
        if (!cell) {
            cell = ::create<UITableViewCell>(&UITableViewCell::initWithStyle_reuseIdentifier,
                                             UITableViewCellStyle::Value1, std::string("row"));
            ++cellsMade;
        }
        cell->textLabel().setText(std::to_string(path.row));
        return cell;
    }

    void tableView_didSelectRowAtIndexPath(UITableView& tableView,
                                           const NSIndexPath& path) override {
        selected = path.row;
        tableView.deselectRowAtIndexPath_animated(path, true);
    }

    NSInteger rows = length;
    int cellsMade = 0;
    std::optional<NSInteger> selected;
};

class LongTableView : public testing::Test {
  protected:
    LongTableView() {
        Host::install(host_);
        table_ = ::create<LongTable>();
        table_->viewWillAppear(false);
        view_ = std::make_unique<RowsView>(PaneContent::of(table_, *navigation_), screen_, nullptr);
        QObject::connect(&screen_, &PaneScreen::drawing, view_.get(), &RowsView::draw);
        view_->resize(360, 720);
        view_->show();
        view_->draw();
    }

    ~LongTableView() override {
        view_.reset();
        Host::install(nullptr);
    }

    void reload() { table_->tableView().reloadData(); }

    void press() { QTest::mousePress(view_->viewport(), Qt::LeftButton, Qt::NoModifier, finger); }

    void release() {
        QTest::mouseRelease(view_->viewport(), Qt::LeftButton, Qt::NoModifier, finger);
    }

    std::string textOfRow(NSInteger row) {
        const auto cell = view_->content().cell(row);
        return cell ? cell->textLabel().text().value_or("") : "none";
    }

    static constexpr QPoint finger = QPoint(100, 300);

    WindowScreen screen_;
    Notices notices_;
    std::shared_ptr<CompanionHost> host_ =
        std::make_shared<CompanionHost>(Places{}, screen_, notices_);
    std::shared_ptr<NavigationController> navigation_ = ::create<NavigationController>();
    std::shared_ptr<LongTable> table_;
    std::unique_ptr<RowsView> view_;
};

TEST_F(LongTableView, makesCellsForTheRowsOnTheScreenOnly) {
    EXPECT_LE(table_->cellsMade, 20);
    EXPECT_EQ(textOfRow(0), "0");
    EXPECT_EQ(textOfRow(length - 1), "none");
}

TEST_F(LongTableView, scrolledFromEndToEndMakesFewCells) {
    for (int step = 0; step <= 1000; ++step) {
        auto& bar = *view_->verticalScrollBar();
        bar.setValue(bar.maximum() / 1000 * step);
    }
    view_->verticalScrollBar()->setValue(view_->verticalScrollBar()->maximum());
    EXPECT_EQ(textOfRow(length - 1), std::to_string(length - 1));
    EXPECT_LE(table_->cellsMade, 40);
}

TEST_F(LongTableView, endKeyShowsTheLastRowAndSpaceTapsIt) {
    QTest::keyClick(view_.get(), Qt::Key_End);
    QTest::keyClick(view_.get(), Qt::Key_Space);
    EXPECT_EQ(table_->selected, length - 1);
}

TEST_F(LongTableView, clickTapsTheRowThatIsPaintedThere) {
    view_->verticalScrollBar()->setValue(qRound(view_->layout().rowHeight()) * 5000 + 7);
    const auto row = view_->layout().rowAt(view_->onPane(QPointF(100, 300)));
    ASSERT_TRUE(row);
    QTest::mouseClick(view_->viewport(), Qt::LeftButton, Qt::NoModifier, QPoint(100, 300));
    EXPECT_EQ(table_->selected, row);
    EXPECT_GE(*row, 5000);
}

TEST_F(LongTableView, tableThatShrinksUnderTheFingerIsNotAskedForRowsItLacks) {
    view_->verticalScrollBar()->setValue(view_->verticalScrollBar()->maximum());
    table_->rows = 3;
    table_->tableView().reloadData();
    QTest::mouseClick(view_->viewport(), Qt::LeftButton, Qt::NoModifier, QPoint(100, 300));
    EXPECT_EQ(table_->selected, std::nullopt);
    QCoreApplication::processEvents();
    EXPECT_EQ(view_->layout().rowCount(), 3);
    EXPECT_EQ(textOfRow(2), "2");
}

TEST_F(LongTableView, fingerThatWasDownBeforeAReloadTapsNothing) {
    press();
    reload();
    view_->draw();
    release();
    EXPECT_EQ(table_->selected, std::nullopt);
}

TEST_F(LongTableView, fingerThatComesDownBetweenAReloadAndItsDrawingTapsNothing) {
    reload();
    press();
    view_->draw();
    release();
    EXPECT_EQ(table_->selected, std::nullopt);
}

TEST_F(LongTableView, fingerTapsAgainAfterTheDrawing) {
    reload();
    view_->draw();
    press();
    release();
    EXPECT_NE(table_->selected, std::nullopt);
}

TEST_F(LongTableView, fingerStaysOnARowWhileOnlyItsTextIsTakenAnew) {
    press();
    const auto row = *view_->layout().rowAt(QPointF(finger));
    table_->tableView().reloadRowsAtIndexPaths_withRowAnimation({{0, row}},
                                                                UITableViewRowAnimation::Fade);
    view_->draw();
    release();
    EXPECT_EQ(table_->selected, row);
}

TEST_F(LongTableView, keyThatScrollsToTheCurrentRowTapsNothingBeforeTheDrawing) {
    QTest::keyClick(view_.get(), Qt::Key_End);
    view_->verticalScrollBar()->setValue(0);
    reload();
    QTest::keyClick(view_.get(), Qt::Key_Space);
    EXPECT_EQ(table_->selected, std::nullopt);
}

TEST_F(LongTableView, screenReaderPressesNoRowThatWasNotDrawn) {
    auto* list = QAccessible::queryAccessibleInterface(view_.get());
    auto* line = list->child(view_->layout().lineOfRow(3));
    ASSERT_EQ(line->text(QAccessible::Name), "3");
    reload();
    EXPECT_EQ(line->text(QAccessible::Name), "3");
    line->actionInterface()->doAction(QAccessibleActionInterface::pressAction());
    EXPECT_EQ(table_->selected, std::nullopt);
}

TEST_F(LongTableView, rowsAreTallEnoughForAFinger) {
    EXPECT_GE(view_->layout().rowRect(0).height(), 44);
}

} // namespace

} // namespace quorl::tests
