#include "runtime/lists/TableView.h"

#include <set>

#include <gmock/gmock.h>

#include "tests/support/TestHost.h"

namespace {

using quorl::TableView;
using quorl::tests::TestHost;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

constexpr auto row = NSIndexPath::indexPathForRow_inSection;

/// A table of two sections whose cells say which row they were last made for.
class Rows : public UITableViewController {
  public:
    NSInteger numberOfSectionsInTableView(UITableView& /*tableView*/) override { return 2; }

    NSInteger tableView_numberOfRowsInSection(UITableView& /*tableView*/,
                                              NSInteger section) override {
        return section == 0 ? firstLength : secondLength;
    }

    std::shared_ptr<UITableViewCell>
    tableView_cellForRowAtIndexPath(UITableView& tableView, const NSIndexPath& path) override {
        ++asked;
        auto cell = tableView.dequeueReusableCellWithIdentifier(path.section == 0 ? "A" : "B");
        if (!cell) {
            cell = create<UITableViewCell>(&UITableViewCell::initWithStyle_reuseIdentifier,
                                           UITableViewCellStyle::Default,
                                           path.section == 0 ? "A" : "B");
            ++made;
        }
        cell->textLabel().setText(std::to_string(path.section) + "." + std::to_string(path.row));
        return cell;
    }

    void tableView_didSelectRowAtIndexPath(UITableView& /*tableView*/,
                                           const NSIndexPath& /*path*/) override {}

    NSInteger firstLength = 3;
    NSInteger secondLength = 2;
    int asked = 0;
    int made = 0;
};

class Table : public testing::Test {
  protected:
    Table() {
        table_.setRowsOnScreen(3);
        rows_->viewWillAppear(false);
    }

    void draw() { table_.draw(); }

    /// What the rows on the screen say, from top to bottom.
    [[nodiscard]] std::vector<std::string> shown() const {
        std::vector<std::string> texts;
        for (const auto& visible : table_.visibleRows()) {
            texts.push_back(visible.cell->textLabel().text().value_or("null"));
        }
        return texts;
    }

    std::shared_ptr<TestHost> host_ = TestHost::installed();
    std::shared_ptr<Rows> rows_ = create<Rows>();
    TableView& table_ = TableView::of(*rows_);
};

TEST_F(Table, ShowsTheRowsThatFitOnTheScreen) {
    draw();

    EXPECT_THAT(shown(), ElementsAre("0.0", "0.1", "0.2"));
    EXPECT_THAT(table_.sectionLengths(), ElementsAre(3, 2));
    EXPECT_EQ(table_.rowCount(), 5);
    EXPECT_EQ(table_.firstRow(), 0);
}

TEST_F(Table, IsDrawnOnTheScreenOnly) {
    rows_->viewDidDisappear(false);
    draw();
    EXPECT_THAT(shown(), IsEmpty());
    EXPECT_EQ(rows_->asked, 0);

    rows_->viewWillAppear(false);
    draw();
    EXPECT_THAT(shown(), SizeIs(3));
}

TEST_F(Table, AsksForEachRowOnceUntilSomethingChanges) {
    draw();
    draw();
    draw();

    EXPECT_EQ(rows_->asked, 3);
}

TEST_F(Table, ShowsOnlyTheRowsThatAreWanted) {
    table_.showOnly(std::vector<NSInteger>{1, 3, 4});
    draw();
    EXPECT_THAT(shown(), ElementsAre("0.1", "1.0", "1.1"));
    EXPECT_TRUE(table_.cellForRowAtIndexPath(row(1, 0)));
    EXPECT_FALSE(table_.cellForRowAtIndexPath(row(0, 0)));

    table_.showOnly(std::nullopt);
    draw();
    EXPECT_THAT(shown(), ElementsAre("0.0", "0.1", "0.2"));
}

TEST_F(Table, ScrollsOverTheRowsThatAreWanted) {
    table_.setRowsOnScreen(1);
    table_.showOnly(std::vector<NSInteger>{1, 4});
    table_.scrollToRow(1);
    draw();
    EXPECT_THAT(shown(), ElementsAre("1.1"));
    EXPECT_EQ(table_.firstRow(), 1);
}

TEST_F(Table, LeavesOutWantedRowsThatAReloadTakesAway) {
    table_.showOnly(std::vector<NSInteger>{1, 4});
    draw();
    rows_->secondLength = 0;
    table_.reloadData();
    draw();
    EXPECT_THAT(shown(), ElementsAre("0.1"));
}

TEST_F(Table, LendsTheCellOfARowOffTheScreen) {
    draw();
    const auto cell = table_.borrowCell(4);
    ASSERT_TRUE(cell);
    EXPECT_EQ(cell->textLabel().text(), "1.1");
    EXPECT_THAT(shown(), ElementsAre("0.0", "0.1", "0.2"));
    EXPECT_EQ(table_.borrowCell(4), cell) << "a cell is made once";
    EXPECT_EQ(table_.borrowCell(5), nullptr);
    table_.reloadData();
    EXPECT_EQ(table_.borrowCell(0), nullptr);
}

TEST_F(Table, KnowsThePlaceOfEachRow) {
    draw();

    EXPECT_EQ(table_.pathOfRow(0), row(0, 0));
    EXPECT_EQ(table_.pathOfRow(2), row(2, 0));
    EXPECT_EQ(table_.pathOfRow(3), row(0, 1));
    EXPECT_EQ(table_.pathOfRow(4), row(1, 1));
}

TEST_F(Table, KnowsThePlaceOfARowBehindAnEmptySection) {
    rows_->firstLength = 0;
    draw();

    EXPECT_EQ(table_.pathOfRow(0), row(0, 1));
    EXPECT_THAT(shown(), ElementsAre("1.0", "1.1"));
}

TEST_F(Table, HasCellsForTheRowsOnScreenOnly) {
    draw();

    ASSERT_NE(table_.cellForRowAtIndexPath(row(2, 0)), nullptr);
    EXPECT_EQ(table_.cellForRowAtIndexPath(row(2, 0))->textLabel().text(), "0.2");
    EXPECT_EQ(table_.cellForRowAtIndexPath(row(0, 1)), nullptr) << "below the screen";
    EXPECT_EQ(table_.cellForRowAtIndexPath(row(3, 0)), nullptr) << "no such row";
    EXPECT_EQ(table_.cellForRowAtIndexPath(row(-1, 0)), nullptr);
    EXPECT_EQ(table_.cellForRowAtIndexPath(row(0, 2)), nullptr);
    EXPECT_EQ(table_.cellForRowAtIndexPath(row(0, -1)), nullptr);
}

TEST_F(Table, HasNoCellsBetweenAReloadAndTheNextDrawing) {
    draw();

    rows_->tableView().reloadData();
    EXPECT_EQ(table_.cellForRowAtIndexPath(row(0, 0)), nullptr);

    draw();
    EXPECT_NE(table_.cellForRowAtIndexPath(row(0, 0)), nullptr);
    EXPECT_EQ(rows_->asked, 6);
}

TEST_F(Table, HasNoCellsBeforeItIsDrawnFirst) {
    EXPECT_EQ(table_.cellForRowAtIndexPath(row(0, 0)), nullptr);
}

TEST_F(Table, ScrollsToTheRowThatIsWanted) {
    draw();

    table_.scrollToRow(2);
    draw();

    EXPECT_EQ(table_.firstRow(), 2);
    EXPECT_THAT(shown(), ElementsAre("0.2", "1.0", "1.1"));
}

TEST_F(Table, ScrollsNoFurtherThanItsEnds) {
    table_.scrollToRow(100);
    draw();
    EXPECT_THAT(shown(), ElementsAre("0.2", "1.0", "1.1"));

    table_.scrollToRow(-5);
    draw();
    EXPECT_THAT(shown(), ElementsAre("0.0", "0.1", "0.2"));
}

TEST_F(Table, KeepsItsPlaceOverAReload) {
    table_.scrollToRow(1);
    draw();

    rows_->tableView().reloadData();
    draw();

    EXPECT_EQ(table_.firstRow(), 1);
}

TEST_F(Table, MovesUpWhenItHasShrunk) {
    table_.scrollToRow(2);
    draw();

    rows_->firstLength = 0;
    rows_->tableView().reloadData();
    draw();

    EXPECT_EQ(table_.firstRow(), 0);
    EXPECT_THAT(shown(), ElementsAre("1.0", "1.1"));
}

TEST_F(Table, UsesTheCellsOfRowsThatLeftTheScreenAgain) {
    rows_->firstLength = 10;
    draw();
    const auto left = table_.cellForRowAtIndexPath(row(0, 0));

    table_.scrollToRow(1);
    draw();

    EXPECT_EQ(rows_->made, 3);
    EXPECT_EQ(table_.cellForRowAtIndexPath(row(3, 0)), left);
    EXPECT_EQ(left->textLabel().text(), "0.3");
}

TEST_F(Table, UsesACellForItsOwnKindOfRowOnly) {
    draw();
    EXPECT_EQ(rows_->made, 3);

    table_.scrollToRow(2);
    draw();

    EXPECT_EQ(rows_->made, 5) << "the second section has cells of another kind";
}

TEST_F(Table, TakesACellOutOfItsStoreOnce) {
    draw();
    rows_->tableView().reloadData();

    std::set<std::shared_ptr<UITableViewCell>> taken;
    while (const auto cell = rows_->tableView().dequeueReusableCellWithIdentifier("A")) {
        taken.insert(cell);
    }

    EXPECT_THAT(taken, SizeIs(3));
    EXPECT_EQ(rows_->tableView().dequeueReusableCellWithIdentifier("unknown"), nullptr);
}

TEST_F(Table, AsksAgainForTheRowsThatAreReloaded) {
    draw();

    rows_->tableView().reloadRowsAtIndexPaths_withRowAnimation({row(1, 0)},
                                                               UITableViewRowAnimation::Fade);
    EXPECT_EQ(rows_->asked, 3);
    EXPECT_NE(table_.cellForRowAtIndexPath(row(1, 0)), nullptr) << "until it is drawn";
    draw();

    EXPECT_EQ(rows_->asked, 4);
    EXPECT_THAT(shown(), ElementsAre("0.0", "0.1", "0.2"));
}

TEST_F(Table, DoesNotAskForReloadedRowsThatAreNotThere) {
    draw();

    rows_->tableView().reloadRowsAtIndexPaths_withRowAnimation(
        {row(1, 1), row(77, 0), row(0, 9), row(-1, 0)}, UITableViewRowAnimation::Fade);
    draw();

    EXPECT_EQ(rows_->asked, 3);
}

TEST_F(Table, FollowsTheSizeOfTheScreen) {
    table_.setRowsOnScreen(1);
    draw();
    EXPECT_THAT(shown(), ElementsAre("0.0"));

    table_.setRowsOnScreen(100);
    draw();
    EXPECT_THAT(shown(), SizeIs(5));

    table_.setRowsOnScreen(-1);
    draw();
    EXPECT_THAT(shown(), IsEmpty());
}

TEST_F(Table, OfAHundredThousandRowsMakesAsManyCellsAsFit) {
    rows_->firstLength = 100'000;
    table_.setRowsOnScreen(20);

    for (NSInteger first = 0; first < 100'000; first += 1'000) {
        table_.scrollToRow(first);
        draw();
    }

    EXPECT_EQ(rows_->made, 20);
    EXPECT_EQ(rows_->asked, 100 * 20);
}

TEST_F(Table, TellsTheScreenWhatHappensToIt) {
    UITableView& table = rows_->tableView();

    table.reloadData();
    table.reloadRowsAtIndexPaths_withRowAnimation({row(0, 1), row(1, 1)},
                                                  UITableViewRowAnimation::Fade);
    table.deselectRowAtIndexPath_animated(row(2, 0), true);

    EXPECT_THAT(host_->journal.lines({"table", "rows", "deselect"}),
                ElementsAre("table", "rows 1.0 1.1 fading", "deselect 0.2 fading"));
}

} // namespace
