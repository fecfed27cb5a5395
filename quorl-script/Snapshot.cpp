#include "quorl-script/Snapshot.h"

#include "quorl-script/Naming.h"
#include "runtime/lists/ListView.h"
#include "runtime/lists/TableView.h"

namespace quorl {

namespace {

Json specifierOf(const ListView::Row& row) {
    const PSSpecifier& specifier = *row.specifier;
    Json entry;
    entry["cell"] = static_cast<NSInteger>(specifier.cellType());
    entry["title"] = textOf(specifier.name());
    if (specifier.cellType() == PSCellType::Group) {
        entry["footer"] = textOf(row.footer);
        return entry;
    }
    const auto& detail = specifier.detailControllerClass();
    entry["value"] = textOf(row.value);
    entry["detail"] = detail ? Json(detail->name()) : Json(nullptr);
    return entry;
}

Json specifiersOf(const PSListController& list) {
    Json specifiers = Json::array();
    for (const auto& row : ListView::of(list).rows()) {
        specifiers.push_back(specifierOf(row));
    }
    return specifiers;
}

Json cellOf(const TableView::VisibleRow& row) {
    const UITableViewCell& cell = *row.cell;
    Json entry;
    entry["row"] = row.path.row;
    entry["class"] = className(cell);
    entry["style"] = static_cast<NSInteger>(cell.style());
    entry["reuse"] = cell.reuseIdentifier();
    entry["title"] = textOf(cell.textLabel().text());
    entry["detail"] = textOf(cell.detailTextLabel().text());
    entry["accessory"] = static_cast<NSInteger>(cell.accessoryType());
    entry["textColor"] = textOf(cell.textLabel().textColor());
    entry["tintColor"] = textOf(cell.tintColor());
    return entry;
}

Json sectionsOf(const TableView& table) {
    Json sections = Json::array();
    for (const NSInteger rows : table.sectionLengths()) {
        sections.push_back({{"rows", rows}, {"cells", Json::array()}});
    }
    for (const auto& row : table.visibleRows()) {
        if (row.cell) {
            sections[static_cast<std::size_t>(row.path.section)]["cells"].push_back(cellOf(row));
        }
    }
    return sections;
}

} // namespace

Json snapshotOf(const std::vector<std::shared_ptr<UIViewController>>& panes) {
    Json stack = Json::array();
    for (const auto& pane : panes) {
        Json entry;
        entry["class"] = className(*pane);
        entry["title"] = textOf(pane->title());
        if (const auto* list = dynamic_cast<const PSListController*>(pane.get())) {
            entry["specifiers"] = specifiersOf(*list);
        } else if (const auto* table = dynamic_cast<const UITableViewController*>(pane.get())) {
            entry["style"] = static_cast<NSInteger>(table->style());
            entry["sections"] = sectionsOf(TableView::of(*table));
        }
        stack.push_back(std::move(entry));
    }
    return stack;
}

} // namespace quorl
