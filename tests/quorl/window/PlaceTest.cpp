#include <QScrollBar>
#include <QTest>

#include <gmock/gmock.h>

#include "tests/quorl/window/ShownTable.h"

namespace quorl::tests {

namespace {

using testing::ElementsAre;

std::vector<std::string> with(const std::string& name, std::vector<std::string> names) {
    names.insert(names.begin(), name);
    return names;
}

std::vector<std::string> without(const std::string& name, std::vector<std::string> names) {
    std::erase(names, name);
    return names;
}

TEST(Place, focusFollowsThePlaylistWhenOneIsAddedAbove) {
    ShownTable shown(manyNames(5));
    shown.view().setCurrentRow(2);
    shown.reloadWith(with("Above", manyNames(5)));
    EXPECT_EQ(shown.currentName(), "Name 1002");
    shown.press(Qt::Key_Return);
    EXPECT_THAT(shown.table().selected, ElementsAre("Name 1002"));
}

TEST(Place, focusFollowsThePlaylistWhenOneIsTakenAwayAbove) {
    ShownTable shown(manyNames(5));
    shown.view().setCurrentRow(2);
    shown.reloadWith(without("Name 1000", manyNames(5)));
    EXPECT_EQ(shown.currentName(), "Name 1002");
}

TEST(Place, focusStaysAtTheNearestRowWhenItsPlaylistIsGone) {
    ShownTable shown(manyNames(5));
    shown.view().setCurrentRow(2);
    shown.reloadWith(without("Name 1002", manyNames(5)));
    EXPECT_EQ(shown.currentName(), "Name 1003");
    shown.reloadWith(with("Above", without("Name 1002", manyNames(5))));
    EXPECT_EQ(shown.currentName(), "Name 1003");
}

TEST(Place, focusAtTheEndStaysAtTheEndWhenItsRowIsGone) {
    ShownTable shown({"One", "Two"});
    shown.view().setCurrentRow(2);
    ASSERT_EQ(shown.currentName(), "None");
    shown.reloadWith({});
    EXPECT_EQ(shown.currentName(), "None");
}

TEST(Place, secondOfTwoPlaylistsOfOneNameStaysTheSecond) {
    ShownTable shown({"Mix", "Mix", "Other"});
    shown.view().setCurrentRow(1);
    shown.reloadWith({"Above", "Mix", "Mix", "Other"});
    EXPECT_EQ(shown.view().currentRow(), 2);
    shown.reloadWith({"Mix", "Mix", "Other"});
    EXPECT_EQ(shown.view().currentRow(), 1);
}

TEST(Place, playlistThatIsCalledAsTheRowOfAnotherSectionIsNotTakenForIt) {
    ShownTable shown({"A", "None"}, "nobody");
    shown.view().setCurrentRow(2);
    shown.reloadWith({"A", "B", "None"});
    EXPECT_EQ(shown.view().currentRow(), 3);
}

TEST(Place, rowsOnTheScreenStayThereWhenOthersAreAddedAbove) {
    ShownTable shown(manyNames(100), "nobody");
    shown.view().verticalScrollBar()->setValue(1000);
    const auto before = shown.namesOnScreen();
    shown.reloadWith(with("Above", with("Also Above", manyNames(100))));
    EXPECT_EQ(shown.namesOnScreen(), before);
}

TEST(Place, rowsOnTheScreenStayThereWhenTheTopmostIsGone) {
    ShownTable shown(manyNames(100), "nobody");
    shown.view().verticalScrollBar()->setValue(1000);
    auto before = shown.namesOnScreen();
    const auto gone = before.front();
    shown.reloadWith(without(gone, with("Above", manyNames(100))));
    before.erase(before.begin());
    EXPECT_THAT(shown.namesOnScreen(), testing::IsSupersetOf(before));
}

TEST(Place, whoIsAtTheTopSeesWhatArrivesThere) {
    ShownTable shown(manyNames(100), "nobody");
    shown.reloadWith(with("Above", manyNames(100)));
    EXPECT_EQ(shown.namesOnScreen().front(), "Above");
    EXPECT_EQ(shown.currentName(), "Name 1000");
}

TEST(Place, focusOffTheScreenFollowsItsPlaylistToo) {
    ShownTable shown(manyNames(100), "nobody");
    shown.view().setCurrentRow(3);
    shown.view().verticalScrollBar()->setValue(2000);
    shown.reloadWith(with("Above", manyNames(100)));
    EXPECT_EQ(shown.currentName(), "Name 1003");
}

TEST(Place, tableOpensAtTheRowThatIsChecked) {
    ShownTable shown(manyNames(300), "Name 1200");
    EXPECT_EQ(shown.currentName(), "Name 1200");
    EXPECT_THAT(shown.namesOnScreen(), testing::Contains("Name 1200"));
    EXPECT_THAT(shown.namesOnScreen(), testing::Contains("Name 1197"));
    EXPECT_THAT(shown.namesOnScreen(), testing::Contains("Name 1203"));
}

TEST(Place, rowThatIsCheckedFarDownIsFoundInTime) {
    ShownTable shown(manyNames(6000), "Name 6500");
    EXPECT_TRUE(QTest::qWaitFor([&shown] { return shown.currentName() == "Name 6500"; }, 60'000));
}

TEST(Place, whoMovedMeanwhileIsNotTakenToTheRowThatIsChecked) {
    ShownTable shown(manyNames(6000), "Name 6500");
    shown.press(Qt::Key_Down);
    for (int turn = 0; turn < 50; ++turn) {
        QCoreApplication::processEvents();
    }
    EXPECT_EQ(shown.currentName(), "Name 1001");
}

} // namespace

} // namespace quorl::tests
