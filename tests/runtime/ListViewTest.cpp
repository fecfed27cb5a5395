#include "runtime/lists/ListView.h"

#include <gmock/gmock.h>

#include "tests/support/TestHost.h"

namespace {

using quorl::ListView;
using quorl::tests::TestHost;
using testing::ElementsAre;
using testing::IsEmpty;

/// A list of one group and one row, whose value counts how often it was asked for.
class List : public PSListController {
  public:
    NSArray<PSSpecifier> specifiers() override {
        if (!_specifiers) {
            using Rows = std::vector<std::shared_ptr<PSSpecifier>>;
            _specifiers = std::make_shared<const Rows>(Rows{group, makeRow()});
        }
        return _specifiers;
    }

    std::optional<std::string> value(const std::shared_ptr<PSSpecifier>& specifier) {
        askedFor = specifier;
        return "value " + std::to_string(++asked);
    }

    [[nodiscard]] std::shared_ptr<PSSpecifier> makeRow() {
        row = PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
            "Row", strong(this), std::nullopt, PSGetter::of<&List::value>("value:"), std::nullopt,
            PSCellType::LinkList, std::nullopt);
        return row;
    }

    std::shared_ptr<PSSpecifier> group =
        PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
            "Group", nullptr, std::nullopt, std::nullopt, std::nullopt, PSCellType::Group,
            std::nullopt);
    std::shared_ptr<PSSpecifier> row;
    std::shared_ptr<PSSpecifier> askedFor;
    int asked = 0;
};

class Lists : public testing::Test {
  protected:
    void show() {
        (void)list_->specifiers();
        list_->viewWillAppear(false);
        list_->viewDidAppear(false);
        draw();
    }

    void draw() { ListView::of(*list_).draw(); }

    /// The values on the screen, from top to bottom.
    [[nodiscard]] std::vector<std::string> values() const {
        std::vector<std::string> texts;
        for (const auto& shown : ListView::of(*list_).rows()) {
            texts.push_back(shown.value.value_or("null"));
        }
        return texts;
    }

    std::shared_ptr<TestHost> host_ = TestHost::installed();
    std::shared_ptr<List> list_ = create<List>();
};

TEST_F(Lists, AreNotDrawnBeforeTheyWereShown) {
    (void)list_->specifiers();
    draw();
    list_->viewWillAppear(false);
    draw();

    EXPECT_THAT(ListView::of(*list_).rows(), IsEmpty());
    EXPECT_EQ(list_->asked, 0);
}

TEST_F(Lists, ShowEachRowWithItsValueAndFooter) {
    list_->group->setProperty_forKey("below", PSFooterTextGroupKey);
    show();

    ASSERT_THAT(values(), ElementsAre("null", "value 1"));
    EXPECT_EQ(ListView::of(*list_).rows()[0].footer, "below");
    EXPECT_EQ(ListView::of(*list_).rows()[1].footer, std::nullopt);
    EXPECT_EQ(ListView::of(*list_).rows()[1].specifier, list_->row);
    EXPECT_EQ(list_->askedFor, list_->row);
}

TEST_F(Lists, AreDrawnOnceUntilTheyAreReloaded) {
    show();
    draw();
    EXPECT_THAT(values(), ElementsAre("null", "value 1"));

    list_->reload();
    EXPECT_THAT(values(), ElementsAre("null", "value 1")) << "until it is drawn";
    draw();
    EXPECT_THAT(values(), ElementsAre("null", "value 2"));
}

TEST_F(Lists, ShowANewFooterOnlyOnceTheyAreReloadedAndDrawn) {
    show();

    list_->group->setProperty_forKey("new", PSFooterTextGroupKey);
    draw();
    EXPECT_EQ(ListView::of(*list_).rows()[0].footer, std::nullopt);

    list_->reload();
    draw();
    EXPECT_EQ(ListView::of(*list_).rows()[0].footer, "new");
}

TEST_F(Lists, TakeTheValueOfAReloadedRowAtOnce) {
    show();

    list_->reloadSpecifier(list_->row);

    EXPECT_THAT(values(), ElementsAre("null", "value 2"));
}

TEST_F(Lists, AskForTheValueOfAReloadedRowAlsoWhileTheyAreHidden) {
    (void)list_->specifiers();

    list_->reloadSpecifier(list_->row);

    EXPECT_EQ(list_->asked, 1);
    EXPECT_THAT(ListView::of(*list_).rows(), IsEmpty());
}

TEST_F(Lists, AreDrawnWhileAnotherPaneCoversThem) {
    show();
    list_->viewWillDisappear(false);
    list_->viewDidDisappear(false);

    list_->reload();
    draw();

    EXPECT_THAT(values(), ElementsAre("null", "value 2"));
}

TEST_F(Lists, DoNothingForTheReloadOfNoRowAndOfAStrangersRow) {
    show();
    const auto stranger = create<List>();
    (void)stranger->specifiers();

    list_->reloadSpecifier(nullptr);
    list_->reloadSpecifier(stranger->row);

    EXPECT_EQ(list_->asked, 1);
    EXPECT_EQ(stranger->asked, 0);
}

TEST_F(Lists, DoNothingForTheReloadOfARowBeforeTheyWereBuilt) {
    const auto early = list_->makeRow();

    list_->reloadSpecifier(early);

    EXPECT_EQ(list_->asked, 0);
}

TEST_F(Lists, TellTheScreenWhatHappensToThem) {
    (void)list_->specifiers();
    list_->reloadSpecifier(list_->row);
    list_->reloadSpecifier(nullptr);
    list_->reload();
    list_->group->setProperty_forKey("text", PSFooterTextGroupKey);
    list_->group->setProperty_forKey(std::nullopt, PSFooterTextGroupKey);
    list_->handleURL("quorl:somewhere");

    EXPECT_THAT(host_->journal.lines({"row", "list", "footer", "url"}),
                ElementsAre("row Row", "row null", "list", "footer text", "footer null",
                            "url quorl:somewhere"));
}

TEST_F(Lists, DoNothingForWhatHappensToTheDevice) {
    show();

    list_->suspend();
    list_->didLock();
    list_->willUnlock();
    list_->didUnlock();
    list_->didWake();
    list_->willBecomeActive();
    list_->willResignActive();
    list_->statusBarWillAnimateByHeight(20);
    list_->setPreferenceValue_specifier(nullptr, list_->row);

    EXPECT_EQ(list_->asked, 1);
    EXPECT_EQ(list_->readPreferenceValue(list_->row), nullptr);
    EXPECT_TRUE(list_->canBeShownFromSuspendedState());
}

TEST(RowDescriptions, KeepTheirPropertiesUntilTheyAreTakenAway) {
    const auto host = TestHost::installed();
    const auto row = create<PSSpecifier>();

    EXPECT_EQ(row->propertyForKey("key"), std::nullopt);
    row->setProperty_forKey("one", "key");
    row->setProperty_forKey("two", "key");
    EXPECT_EQ(row->propertyForKey("key"), "two");
    EXPECT_EQ(row->propertyForKey("other"), std::nullopt);
    row->setProperty_forKey(std::nullopt, "key");
    EXPECT_EQ(row->propertyForKey("key"), std::nullopt);
}

TEST(RowDescriptions, DoNotOwnTheirTargetAndHaveNoValueWithoutIt) {
    const auto host = TestHost::installed();
    auto list = create<List>();
    const std::weak_ptr<List> watched = list;
    const auto row = list->makeRow();
    EXPECT_EQ(row->value(), "value 1");

    list->askedFor.reset();
    list->row.reset();
    list.reset();

    EXPECT_TRUE(watched.expired());
    EXPECT_EQ(row->value(), std::nullopt);
}

TEST(RowDescriptions, HaveNoValueWithoutAGetter) {
    const auto host = TestHost::installed();
    const auto target = create<NSObject>();
    const auto row = PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
        std::nullopt, target, std::nullopt, std::nullopt, std::nullopt, PSCellType::Group,
        std::nullopt);

    EXPECT_EQ(row->value(), std::nullopt);
    EXPECT_EQ(row->name(), std::nullopt);
    EXPECT_EQ(row->detailControllerClass(), std::nullopt);
}

} // namespace
