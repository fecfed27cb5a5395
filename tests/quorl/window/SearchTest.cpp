#include <QLineEdit>
#include <QScrollBar>
#include <QTest>

#include <gmock/gmock.h>

#include "quorl/search/FoldedText.h"
#include "tests/quorl/window/ShownTable.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

using testing::ElementsAre;

constexpr int patience = 60'000; // milliseconds

QLineEdit& fieldOf(RowsView& view) { return *view.findChild<QLineEdit*>(); }

/// A long table with the search open and a text in its field.
class Search : public testing::Test {
  protected:
    void searchFor(const QString& text) {
        shown_.view().openSearch();
        QTest::keyClicks(&fieldOf(shown_.view()), text);
    }

    static std::vector<std::string> names() {
        auto names = manyNames(200);
        names[7] = "Café";
        names[150] = "cafe latte";
        return names;
    }

    ShownTable shown_ = ShownTable(names(), "Name 1003");
};

TEST_F(Search, fieldLeavesTheRowsWithItsText) {
    searchFor("Name 110");
    EXPECT_THAT(shown_.namesOnScreen(),
                ElementsAre("Name 1100", "Name 1101", "Name 1102", "Name 1103", "Name 1104",
                            "Name 1105", "Name 1106", "Name 1107", "Name 1108", "Name 1109"));
}

TEST_F(Search, fieldIsMadeForTheFirstSearch) {
    EXPECT_EQ(shown_.view().findChild<QLineEdit*>(), nullptr);
    shown_.view().closeSearch();
    EXPECT_FALSE(shown_.view().isSearched());
    searchFor("latte");
    EXPECT_TRUE(shown_.view().isSearched());
}

TEST_F(Search, accentsAndCapitalsMakeNoDifference) {
    searchFor("CAFE");
    EXPECT_THAT(shown_.namesOnScreen(), ElementsAre("Café", "cafe latte"));
    EXPECT_EQ(folded("Ärger ÉTÉ"), folded("arger ete"));
}

TEST_F(Search, clickReachesTheRowThatWasFound) {
    searchFor("latte");
    const auto place = shown_.view().onViewport(shown_.view().layout().rowRect(0)).center();
    QTest::mouseClick(shown_.view().viewport(), Qt::LeftButton, Qt::NoModifier, place.toPoint());
    EXPECT_THAT(shown_.table().selected, ElementsAre("cafe latte"));
}

TEST_F(Search, paneStillKnowsTheCellsThatAreSeen) {
    searchFor("latte");
    const auto cell = shown_.table().tableView().cellForRowAtIndexPath({0, 150});
    ASSERT_TRUE(cell);
    EXPECT_EQ(cell->textLabel().text(), "cafe latte");
    EXPECT_FALSE(shown_.table().tableView().cellForRowAtIndexPath({0, 0}));
}

TEST_F(Search, endShowsAllRowsAtTheOneThatWasFound) {
    searchFor("latte");
    shown_.view().closeSearch();
    EXPECT_EQ(shown_.view().layout().rowCount(), 201);
    EXPECT_EQ(shown_.currentName(), "cafe latte");
    EXPECT_THAT(shown_.namesOnScreen(), testing::Contains("cafe latte"));
}

TEST_F(Search, textThatNoNameHasIsToldSo) {
    searchFor("zebra");
    EXPECT_THAT(shown_.namesOnScreen(), testing::IsEmpty());
    EXPECT_EQ(shown_.view().currentRow(), std::nullopt);
    shown_.view().closeSearch();
    EXPECT_EQ(shown_.view().layout().rowCount(), 201);
}

TEST_F(Search, rowsThatAreLoadedAnewAreSearchedAnew) {
    searchFor("latte");
    auto more = names();
    more.insert(more.begin(), "Latte macchiato");
    shown_.reloadWith(more);
    ASSERT_TRUE(QTest::qWaitFor([this] { return shown_.namesOnScreen().size() == 2; }, patience));
    EXPECT_THAT(shown_.namesOnScreen(), ElementsAre("Latte macchiato", "cafe latte"));
    shown_.reloadWith({"Nothing"});
    ASSERT_TRUE(QTest::qWaitFor([this] { return shown_.namesOnScreen().empty(); }, patience));
}

TEST_F(Search, arrowDownGoesFromTheFieldToTheFirstRow) {
    searchFor("cafe");
    QTest::keyClick(&fieldOf(shown_.view()), Qt::Key_Down);
    EXPECT_TRUE(shown_.view().hasFocus());
    EXPECT_EQ(shown_.currentName(), "Café");
}

TEST_F(Search, shortTableHasNone) {
    shown_.reloadWith({"One", "Two"});
    shown_.view().openSearch();
    EXPECT_FALSE(shown_.view().isSearched());
}

TEST(LongSearch, findsTheLastOfAHundredThousand) {
    ShownTable shown(manyNames(100'000), "Name 1003");
    shown.view().openSearch();
    fieldOf(shown.view()).setText("Name 100999");
    EXPECT_TRUE(QTest::qWaitFor(
        [&shown] { return shown.namesOnScreen() == std::vector<std::string>{"Name 100999"}; },
        patience));
}

TEST_F(Search, lettersGoToTheNameThatBeginsSo) {
    shown_.type("name 11", 1000);
    EXPECT_EQ(shown_.currentName(), "Name 1100");
    shown_.type("5", 1500);
    EXPECT_EQ(shown_.currentName(), "Name 1151");
}

TEST_F(Search, lettersAfterAPauseBeginAnotherName) {
    shown_.type("n", 1000);
    shown_.type("c", 9000);
    EXPECT_EQ(shown_.currentName(), "Café");
    shown_.type("c", 20'000);
    EXPECT_EQ(shown_.currentName(), "cafe latte");
    shown_.type("c", 30'000);
    EXPECT_EQ(shown_.currentName(), "Café");
}

TEST_F(Search, spaceWithinANameTapsNothing) {
    shown_.type("cafe l", 1000);
    EXPECT_EQ(shown_.currentName(), "cafe latte");
    EXPECT_THAT(shown_.table().selected, testing::IsEmpty());
    shown_.type(" ", 9000);
    EXPECT_THAT(shown_.table().selected, ElementsAre("cafe latte"));
}

TEST(SearchInWindow, escapeEndsTheSearchAndStaysInThePane) {
    SampleMusic music;
    for (const char letter : std::string("abcdefghijklmnopqrstuvwxyz")) {
        music.addPlaylist(std::string("Playlist ") + letter);
    }
    Window window(music.path());
    window.click(0);
    ASSERT_EQ(window.title(), "Synced Playlist");
    window.pressWithFocus(Qt::Key_F, Qt::ControlModifier);
    ASSERT_TRUE(window.view().isSearched());
    QTest::keyClicks(QApplication::focusWidget(), "road");
    EXPECT_EQ(window.rows(), QStringList{"Road Trip"});
    window.pressWithFocus(Qt::Key_Escape);
    EXPECT_FALSE(window.view().isSearched());
    EXPECT_EQ(window.title(), "Synced Playlist");
    window.pressWithFocus(Qt::Key_Escape);
    EXPECT_EQ(window.title(), "Music");
}

} // namespace

} // namespace quorl::tests
