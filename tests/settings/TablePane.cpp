#include "tests/settings/TablePane.h"

namespace quorl::tests {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

namespace {

/// A parent that is shown in no navigation, and whose screen notes what it is asked for.
class Parent : public PSListController {};

} // namespace

std::shared_ptr<UITableViewCell>
EmptyTable::dequeueReusableCellWithIdentifier(std::string_view /*identifier*/) {
    return nullptr;
}

std::shared_ptr<UITableViewCell> EmptyTable::cellForRowAtIndexPath(const NSIndexPath& path) const {
    note("cell", path);
    return nullptr;
}

void EmptyTable::reloadData() {
    takeWrites();
    notes_.emplace_back("reload");
}

void EmptyTable::reloadRowsAtIndexPaths_withRowAnimation(const std::vector<NSIndexPath>& paths,
                                                         UITableViewRowAnimation /*animation*/) {
    for (const NSIndexPath& path : paths) {
        note("reload", path);
    }
}

void EmptyTable::deselectRowAtIndexPath_animated(const NSIndexPath& path, bool /*animated*/) {
    note("deselect", path);
}

const std::vector<std::string>& EmptyTable::notes() const {
    takeWrites();
    return notes_;
}

void EmptyTable::note(const std::string& what, const NSIndexPath& path) const {
    takeWrites();
    notes_.push_back(what + " " + std::to_string(path.section) + "." + std::to_string(path.row));
}

void EmptyTable::takeWrites() const {
    for (std::string& line : journal_.lines({"write"})) {
        notes_.push_back(std::move(line));
    }
    journal_.clear();
}

bool checked(const std::shared_ptr<UITableViewCell>& cell) {
    return cell->accessoryType() == UITableViewCellAccessoryType::Checkmark;
}

void TablePaneTest::appear() {
    drain();
    host_->journal.clear();
    setRowsOnScreen(rowsOnScreen_);
    table_->viewWillAppear(false);
    draw();
    table_->viewDidAppear(false);
}

std::vector<std::string> TablePaneTest::titles() const {
    std::vector<std::string> shown;
    for (const auto& visible : TableView::of(*table_).visibleRows()) {
        shown.push_back(visible.cell->textLabel().text().value_or("null"));
    }
    return shown;
}

std::vector<std::string> TablePaneTest::checkedRows() const {
    std::vector<std::string> shown;
    for (const auto& visible : TableView::of(*table_).visibleRows()) {
        if (checked(visible.cell)) {
            shown.push_back(visible.cell->textLabel().text().value_or("null"));
        }
    }
    return shown;
}

void TablePaneTest::expectForwardingToParent() {
    const auto parent = ::create<Parent>();
    controller_->showController(nullptr); // without a parent nothing happens
    controller_->showController_animate(nullptr, true);
    controller_->handleURL("quorl:nowhere");
    controller_->setParentController(parent.get());
    host_->journal.clear();

    controller_->showController(nullptr);
    controller_->showController_animate(nullptr, true);
    controller_->showController_animate(nullptr, false);
    controller_->handleURL("quorl:somewhere");

    EXPECT_THAT(host_->journal.lines({"show", "url"}),
                ElementsAre("show", "show animated", "show at once", "url quorl:somewhere"));
}

void TablePaneTest::expectAccessors() {
    const auto parent = ::create<Parent>();
    auto row = ::create<PSSpecifier>();
    const std::weak_ptr<PSSpecifier> watchedRow = row;
    EXPECT_EQ(controller_->parentController(), nullptr);
    EXPECT_EQ(controller_->rootController(), nullptr);
    EXPECT_EQ(controller_->specifier(), nullptr);

    controller_->setParentController(parent.get());
    controller_->setRootController(navigation_.get());
    controller_->setSpecifier(std::move(row));

    EXPECT_EQ(controller_->parentController(), parent.get());
    EXPECT_EQ(controller_->rootController(), navigation_.get());
    EXPECT_NE(controller_->specifier(), nullptr);
    EXPECT_EQ(parent.use_count(), 1);
    EXPECT_EQ(navigation_.use_count(), 1);
    controller_->setSpecifier(nullptr);
    EXPECT_TRUE(watchedRow.expired());
}

void TablePaneTest::expectNothingForTheDevice() {
    host_->journal.clear();

    controller_->suspend();
    controller_->didLock();
    controller_->willUnlock();
    controller_->didUnlock();
    controller_->didWake();
    controller_->willResignActive();
    controller_->statusBarWillAnimateByHeight(20);
    controller_->setPreferenceValue_specifier(NSNumber::numberWithBool(true), nullptr);

    EXPECT_EQ(controller_->readPreferenceValue(nullptr), nullptr);
    EXPECT_TRUE(controller_->canBeShownFromSuspendedState());
    EXPECT_THAT(host_->journal.lines({"read", "write", "table", "rows", "query"}), IsEmpty());
}

} // namespace quorl::tests
