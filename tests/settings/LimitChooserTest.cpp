#include <gmock/gmock.h>

#include "platform/SizeFormatter.h"
#include "settings/LMQuorlLimitChooser.h"
#include "tests/settings/TablePane.h"

namespace {

using quorl::SyncPreference;
using quorl::tests::checked;
using quorl::tests::EmptyTable;
using quorl::tests::row;
using quorl::tests::TablePaneTest;
using testing::ElementsAre;

class LimitChooser : public TablePaneTest {
  protected:
    /// Shows the chooser of a limit that is stored.
    void show(std::uint64_t type, std::optional<std::uint64_t> amount) {
        store(SyncPreference::AssetSyncLimitType, type);
        store(SyncPreference::AssetSyncLimit, amount);
        show<LMQuorlLimitChooser>();
    }

    using TablePaneTest::show;

    [[nodiscard]] std::vector<std::string> writes() const {
        return host_->journal.lines({"write"});
    }

    static std::string size(std::uint64_t bytes) {
        return CPFSSizeStrings(static_cast<float>(bytes));
    }
};

const NSIndexPath storageRow = row(0, 0);
const NSIndexPath songsRow = row(1, 0);

TEST_F(LimitChooser, IsAGroupedTableWithItsTitle) {
    show(0, 100);

    EXPECT_EQ(table_->title(), "Playlist Limit");
    EXPECT_EQ(table_->style(), UITableViewStyle::Grouped);
    UITableView& tableView = table_->tableView();
    EXPECT_EQ(table_->numberOfSectionsInTableView(tableView), 2);
    EXPECT_EQ(table_->tableView_numberOfRowsInSection(tableView, 0), 2);
    EXPECT_EQ(table_->tableView_numberOfRowsInSection(tableView, 1), 4);
    EXPECT_EQ(table_->tableView_numberOfRowsInSection(tableView, 2), -1);
    EXPECT_EQ(table_->tableView_numberOfRowsInSection(tableView, -1), -1);
    EXPECT_EQ(table_->tableView_cellForRowAtIndexPath(tableView, row(0, 2)), nullptr);
}

TEST_F(LimitChooser, ReadsTypeAndAmountAndRedrawsWhenItAppears) {
    show(1, 50);

    EXPECT_THAT(
        host_->journal.lines({"appear", "read", "table"}),
        ElementsAre("appear at once", "read assetSyncLimitType", "read assetSyncLimit", "table"));
}

TEST_F(LimitChooser, IsNotThereWithoutAHost) {
    quorl::Host::install(nullptr);
    EXPECT_EQ(create<LMQuorlLimitChooser>(), nullptr);
    quorl::Host::install(host_);
}

TEST_F(LimitChooser, ShowsSongPresetsWhereSongsAreCounted) {
    show(1, 50);

    EXPECT_THAT(titles(),
                ElementsAre("Storage", "Songs", "15 Songs", "50 Songs", "125 Songs", "250 Songs"));
    EXPECT_THAT(checkedRows(), ElementsAre("Songs", "50 Songs"));
}

TEST_F(LimitChooser, ShowsSizesWhereStorageIsCounted) {
    show(0, 1024);

    EXPECT_THAT(titles(), ElementsAre("Storage", "Songs", size(104'857'600), size(524'288'000),
                                      size(1'073'741'824), size(2'147'483'648)));
    EXPECT_THAT(checkedRows(), ElementsAre("Storage", size(1'073'741'824)));
}

TEST_F(LimitChooser, ChecksNoAmountThatIsNoPreset) {
    show(1, 300);
    EXPECT_THAT(checkedRows(), ElementsAre("Songs"));
}

TEST_F(LimitChooser, TakesAMissingAmountForZero) {
    show(0, std::nullopt);

    EXPECT_THAT(checkedRows(), ElementsAre("Storage"));
    tapRow(storageRow);
    EXPECT_THAT(writes(), ElementsAre("write assetSyncLimit 0", "write assetSyncLimitType 0"));
}

TEST_F(LimitChooser, ShowsStoragePresetsAsSongsForATypeThatIsNeither) {
    show(7, 500);

    EXPECT_THAT(titles(), ElementsAre("Storage", "Songs", "100 Songs", "500 Songs", "1,024 Songs",
                                      "2,048 Songs"));
    EXPECT_THAT(checkedRows(), ElementsAre("500 Songs"));

    tapRow(row(3, 1));
    EXPECT_THAT(writes(), ElementsAre("write assetSyncLimit 2048", "write assetSyncLimitType 7"));
}

TEST_F(LimitChooser, LeavesTheCellOfAKindBeyondTheTwoAsItCame) {
    show(1, 50);

    const auto beyond = table_->tableView_cellForRowAtIndexPath(table_->tableView(), row(2, 0));

    ASSERT_NE(beyond, nullptr);
    EXPECT_EQ(beyond->textLabel().text(), std::nullopt);
    EXPECT_FALSE(checked(beyond));
}

TEST_F(LimitChooser, TakesATapOnAKindBeyondTheTwoForOneOnSongs) {
    show(0, 500);

    tapRow(row(2, 0));

    EXPECT_THAT(writes(), ElementsAre("write assetSyncLimit 50", "write assetSyncLimitType 1"));
}

TEST_F(LimitChooser, TakesATapBelowTheKindsForOneOnAnAmount) {
    show(1, 50);

    tapRow(row(3, 2));

    EXPECT_THAT(writes(), ElementsAre("write assetSyncLimit 250", "write assetSyncLimitType 1"));
    EXPECT_THAT(checkedRows(), ElementsAre("Songs", "250 Songs"));
}

TEST_F(LimitChooser, MakesSubtitleCellsOfTheListsTextColour) {
    host_->screen().looks.textColor = "#101010";
    show(0, 100);

    const auto type = cell(storageRow);
    const auto amount = cell(row(0, 1));
    EXPECT_EQ(type->style(), UITableViewCellStyle::Subtitle);
    EXPECT_EQ(type->reuseIdentifier(), "0");
    EXPECT_EQ(amount->reuseIdentifier(), "1");
    EXPECT_EQ(type->textLabel().textColor(), "#101010");
}

TEST_F(LimitChooser, LeavesTheTextColourToTheToolkitWhereTheListsHaveNone) {
    show(0, 100);

    EXPECT_EQ(cell(storageRow)->textLabel().textColor(), std::nullopt);
}

TEST_F(LimitChooser, WritesTheAmountBeforeTheTypeWhenAnAmountIsTapped) {
    show(1, 50);
    host_->journal.clear();

    tapRow(row(3, 1));

    EXPECT_THAT(host_->journal.lines({"deselect", "write", "table", "rows"}),
                ElementsAre("deselect 1.3 fading", "write assetSyncLimit 250",
                            "write assetSyncLimitType 1"));
    EXPECT_THAT(checkedRows(), ElementsAre("Songs", "250 Songs"));
}

struct Switch {
    std::uint64_t type;
    std::uint64_t amount;
    std::uint64_t newAmount;
};

class TypeSwitches : public LimitChooser, public testing::WithParamInterface<Switch> {};

TEST_P(TypeSwitches, CarryThePositionOfTheAmountOver) {
    const auto [type, amount, newAmount] = GetParam();
    show(type, amount);
    host_->journal.clear();

    tapRow(type == 1 ? storageRow : songsRow);

    EXPECT_THAT(host_->journal.lines({"rows", "deselect", "write", "table"}),
                ElementsAre("rows 1.0 1.1 1.2 1.3 fading",
                            type == 1 ? "deselect 0.0 fading" : "deselect 0.1 fading",
                            "write assetSyncLimit " + std::to_string(newAmount),
                            "write assetSyncLimitType " + std::to_string(type == 1 ? 0 : 1)));
    draw();
    EXPECT_THAT(checkedRows(), ElementsAre(type == 1 ? "Storage" : "Songs",
                                           type == 1 ? size(newAmount << 20U)
                                                     : std::to_string(newAmount) + " Songs"));
}

INSTANTIATE_TEST_SUITE_P(Table, TypeSwitches,
                         testing::Values(Switch{1, 15, 100}, Switch{1, 50, 500},
                                         Switch{1, 125, 1024}, Switch{1, 250, 2048},
                                         Switch{1, 300, 100}, Switch{0, 100, 15},
                                         Switch{0, 500, 50}, Switch{0, 1024, 125},
                                         Switch{0, 2048, 250}, Switch{0, 7, 15}));

TEST_F(LimitChooser, MovesTheCheckmarkOfTheTypeAtOnce) {
    show(0, 100);

    tapRow(songsRow);

    EXPECT_TRUE(checked(cell(songsRow)));
    EXPECT_FALSE(checked(cell(storageRow)));
}

TEST_F(LimitChooser, WritesBothValuesAgainWhenTheChosenTypeIsTapped) {
    show(1, 300);
    host_->journal.clear();

    tapRow(songsRow);

    EXPECT_THAT(host_->journal.lines({"rows", "table", "deselect", "write"}),
                ElementsAre("deselect 0.1 fading", "write assetSyncLimit 300",
                            "write assetSyncLimitType 1"));
    EXPECT_THAT(checkedRows(), ElementsAre("Songs"));
}

TEST_F(LimitChooser, WritesBothValuesAgainWhenStorageIsTappedTwice) {
    show(0, 500);
    host_->journal.clear();

    tapRow(storageRow);

    EXPECT_THAT(host_->journal.lines({"rows", "deselect", "write"}),
                ElementsAre("deselect 0.0 fading", "write assetSyncLimit 500",
                            "write assetSyncLimitType 0"));
}

TEST_F(LimitChooser, TakesTheTableOfATypeThatIsNeitherForTheOneOfTheOtherType) {
    show(7, 500); // a storage preset; among the song presets it is none
    tapRow(storageRow);
    EXPECT_THAT(writes(), ElementsAre("write assetSyncLimit 100", "write assetSyncLimitType 0"));
}

TEST_F(LimitChooser, CarriesAStoragePresetOfATypeThatIsNeitherOverToSongs) {
    show(7, 500);
    tapRow(songsRow);
    EXPECT_THAT(writes(), ElementsAre("write assetSyncLimit 50", "write assetSyncLimitType 1"));
}

TEST_F(LimitChooser, ShowsTheCheckmarkOfAnAmountThatWasTappedOffScreenOnceItComesBack) {
    show(1, 15);
    setRowsOnScreen(3);
    draw();
    ASSERT_THAT(titles(), ElementsAre("Storage", "Songs", "15 Songs"));

    tapRow(row(2, 1));
    EXPECT_THAT(checkedRows(), ElementsAre("Songs"));

    setRowsOnScreen(6);
    draw();
    EXPECT_THAT(checkedRows(), ElementsAre("Songs", "125 Songs"));
}

TEST_F(LimitChooser, LooksAtTheFourAmountsWhenOneIsTapped) {
    show(1, 50);
    EmptyTable tableView(host_->journal);

    table_->tableView_didSelectRowAtIndexPath(tableView, row(2, 1));

    EXPECT_THAT(tableView.notes(),
                ElementsAre("cell 1.0", "cell 1.1", "cell 1.2", "cell 1.3", "deselect 1.2",
                            "write assetSyncLimit 125", "write assetSyncLimitType 1"));
}

TEST_F(LimitChooser, LooksAtTheTappedKindThenAtTheOtherAndReloadsTheAmounts) {
    show(1, 50);
    EmptyTable tableView(host_->journal);

    table_->tableView_didSelectRowAtIndexPath(tableView, storageRow);

    EXPECT_THAT(tableView.notes(),
                ElementsAre("cell 0.0", "cell 0.1", "reload 1.0", "reload 1.1", "reload 1.2",
                            "reload 1.3", "deselect 0.0", "write assetSyncLimit 500",
                            "write assetSyncLimitType 0"));
}

TEST_F(LimitChooser, ShowsWhatWasChangedElsewhereWhenTheAppBecomesActive) {
    show(1, 15);
    store(SyncPreference::AssetSyncLimitType, 0);
    store(SyncPreference::AssetSyncLimit, 500);
    EXPECT_THAT(checkedRows(), ElementsAre("Songs", "15 Songs"));

    controller_->willBecomeActive();
    draw();

    EXPECT_THAT(checkedRows(), ElementsAre("Storage", size(524'288'000)));
}

TEST_F(LimitChooser, HandsWhatItIsAskedToShowToItsParent) {
    show(0, 100);
    expectForwardingToParent();
}

TEST_F(LimitChooser, KeepsItsRowAndKnowsItsParentAndRootWithoutOwningThem) {
    show(0, 100);
    expectAccessors();
}

TEST_F(LimitChooser, DoesNothingForWhatHappensToTheDevice) {
    show(0, 100);
    expectNothingForTheDevice();
}

TEST_F(LimitChooser, AsksForItsTextsByTheirKeys) {
    show(1, 15);

    EXPECT_THAT(host_->journal.lines({"text"}),
                ElementsAre("text SYNC_SETTINGS_USAGE_LIMIT_TYPE_STORAGE",
                            "text SYNC_SETTINGS_USAGE_LIMIT_TYPE_SONGS",
                            "text SYNC_SETTINGS_USAGE_LIMIT_TYPE_SONGS_FORMAT",
                            "text SYNC_SETTINGS_USAGE_LIMIT_TYPE_SONGS_FORMAT",
                            "text SYNC_SETTINGS_USAGE_LIMIT_TYPE_SONGS_FORMAT",
                            "text SYNC_SETTINGS_USAGE_LIMIT_TYPE_SONGS_FORMAT"));
}

} // namespace
