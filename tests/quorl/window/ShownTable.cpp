#include "tests/quorl/window/ShownTable.h"

#include <QKeyEvent>
#include <QTest>

namespace quorl::tests {

NSInteger NamedTable::numberOfSectionsInTableView(UITableView& /*tableView*/) { return 2; }

NSInteger NamedTable::tableView_numberOfRowsInSection(UITableView& /*tableView*/,
                                                      NSInteger section) {
    return section == 0 ? static_cast<NSInteger>(names.size()) : 1;
}

std::string NamedTable::nameAt(const NSIndexPath& path) const {
    return path.section == 0 ? names.at(static_cast<std::size_t>(path.row)) : "None";
}

std::shared_ptr<UITableViewCell>
NamedTable::tableView_cellForRowAtIndexPath(UITableView& tableView, const NSIndexPath& path) {
    auto cell = tableView.dequeueReusableCellWithIdentifier("row");
    if (!cell) {
        cell = ::create<UITableViewCell>(&UITableViewCell::initWithStyle_reuseIdentifier,
                                         UITableViewCellStyle::Value1, std::string("row"));
    }
    const bool isChecked = nameAt(path) == checked;
    cell->textLabel().setText(nameAt(path));
    cell->detailTextLabel().setText(isChecked ? std::optional(status) : std::nullopt);
    cell->setAccessoryType(isChecked ? UITableViewCellAccessoryType::Checkmark
                                     : UITableViewCellAccessoryType::None);
    return cell;
}

void NamedTable::tableView_didSelectRowAtIndexPath(UITableView& tableView,
                                                   const NSIndexPath& path) {
    selected.push_back(nameAt(path));
    tableView.deselectRowAtIndexPath_animated(path, true);
}

ShownTable::ShownTable(std::vector<std::string> names, const std::string& checked)
    : host_(std::make_shared<CompanionHost>(Places{}, screen_, notices_)),
      navigation_(::create<NavigationController>()) {
    Host::install(host_);
    Look still;
    still.motion = Motion::Reduced;
    screen_.setLook(still);
    table_ = ::create<NamedTable>();
    table_->names = std::move(names);
    table_->checked = checked;
    table_->viewWillAppear(false);
    view_ = std::make_unique<RowsView>(PaneContent::of(table_, *navigation_), screen_, nullptr);
    QObject::connect(&screen_, &PaneScreen::drawing, view_.get(), &RowsView::draw);
    view_->resize(360, 720);
    view_->show();
    view_->activateWindow();
    view_->setFocus();
    (void)QTest::qWaitForWindowActive(view_.get());
    view_->draw();
}

ShownTable::~ShownTable() {
    view_.reset();
    Host::install(nullptr);
}

void ShownTable::reloadWith(std::vector<std::string> names) {
    table_->names = std::move(names);
    table_->tableView().reloadData();
    view_->draw();
}

std::string ShownTable::currentName() {
    const auto row = view_->currentRow();
    const auto cell = row ? view_->content().cellAnywhere(*row) : nullptr;
    return cell ? cell->textLabel().text().value_or("") : "nothing";
}

std::vector<std::string> ShownTable::namesOnScreen() {
    std::vector<std::string> names;
    for (NSInteger row = 0; row < view_->layout().rowCount(); ++row) {
        const auto place = view_->onViewport(view_->layout().rowRect(row));
        const auto cell = view_->content().cell(row);
        if (cell && QRectF(view_->viewport()->rect()).contains(place)) {
            names.push_back(cell->textLabel().text().value_or(""));
        }
    }
    return names;
}

NSInteger ShownTable::rowOf(const std::string& name) {
    for (NSInteger row = 0; row < view_->layout().rowCount(); ++row) {
        if (view_->content().cellAnywhere(row)->textLabel().text() == name) {
            return row;
        }
    }
    return -1;
}

void ShownTable::press(int key, Qt::KeyboardModifiers modifiers) {
    QTest::keyClick(view_.get(), static_cast<Qt::Key>(key), modifiers);
    QCoreApplication::processEvents();
}

void ShownTable::type(const QString& letters, std::uint64_t time) {
    for (const QChar letter : letters) {
        QKeyEvent event(QEvent::KeyPress, letter.toUpper().unicode(), Qt::NoModifier, letter);
        event.setTimestamp(time);
        QCoreApplication::sendEvent(view_.get(), &event);
    }
}

std::vector<std::string> manyNames(int count) {
    std::vector<std::string> names;
    for (int number = 0; number < count; ++number) {
        names.push_back("Name " + std::to_string(1000 + number));
    }
    return names;
}

} // namespace quorl::tests
