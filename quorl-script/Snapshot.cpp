#include "quorl-script/Snapshot.h"

#include "quorl-script/Naming.h"
#include "runtime/lists/ListView.h"
#include "runtime/lists/TableView.h"

namespace quorl {

namespace {

JsonObject specifierOf(const ListView::Row& row) {
    const PSSpecifier& specifier = *row.specifier;
    JsonObject entry;
    entry.set("cell", static_cast<NSInteger>(specifier.cellType())).set("title", specifier.name());
    if (specifier.cellType() == PSCellType::Group) {
        return entry.set("footer", row.footer);
    }
    const auto& detail = specifier.detailControllerClass();
    return entry.set("value", row.value)
        .set("detail", detail ? Json(detail->name()) : Json(nullptr));
}

JsonList specifiersOf(const PSListController& list) {
    JsonList specifiers;
    for (const auto& row : ListView::of(list).rows()) {
        specifiers.add(specifierOf(row));
    }
    return specifiers;
}

JsonObject cellOf(const TableView::VisibleRow& row) {
    const UITableViewCell& cell = *row.cell;
    return JsonObject()
        .set("row", row.path.row)
        .set("class", className(cell))
        .set("style", static_cast<NSInteger>(cell.style()))
        .set("reuse", cell.reuseIdentifier())
        .set("title", cell.textLabel().text())
        .set("detail", cell.detailTextLabel().text())
        .set("accessory", static_cast<NSInteger>(cell.accessoryType()))
        .set("textColor", cell.textLabel().textColor())
        .set("tintColor", cell.tintColor());
}

JsonList sectionsOf(const TableView& table) {
    const auto& lengths = table.sectionLengths();
    std::vector<JsonList> cells(lengths.size());
    for (const auto& row : table.visibleRows()) {
        if (row.cell) {
            cells[static_cast<std::size_t>(row.path.section)].add(cellOf(row));
        }
    }
    JsonList sections;
    for (std::size_t section = 0; section < lengths.size(); ++section) {
        sections.add(JsonObject().set("rows", lengths[section]).set("cells", cells[section]));
    }
    return sections;
}

} // namespace

JsonList snapshotOf(const std::vector<std::shared_ptr<UIViewController>>& panes) {
    JsonList stack;
    for (const auto& pane : panes) {
        JsonObject entry;
        entry.set("class", className(*pane)).set("title", pane->title());
        if (const auto* list = dynamic_cast<const PSListController*>(pane.get())) {
            entry.set("specifiers", specifiersOf(*list));
        } else if (const auto* table = dynamic_cast<const UITableViewController*>(pane.get())) {
            entry.set("style", static_cast<NSInteger>(table->style()))
                .set("sections", sectionsOf(TableView::of(*table)));
        }
        stack.add(entry);
    }
    return stack;
}

} // namespace quorl
