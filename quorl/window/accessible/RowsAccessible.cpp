#include "quorl/window/accessible/RowsAccessible.h"

#include "quorl/window/accessible/LineAccessible.h"

namespace quorl {

void RowsAccessible::install() {
    QAccessible::installFactory([](const QString& /*name*/, QObject* object) {
        auto* view = qobject_cast<RowsView*>(object);
        return static_cast<QAccessibleInterface*>(view ? new RowsAccessible(*view) : nullptr);
    });
}

RowsAccessible::RowsAccessible(RowsView& view)
    : QAccessibleWidget(&view, QAccessible::List), view_(view) {}

RowsAccessible::~RowsAccessible() {
    for (const auto& [line, identifier] : children_) {
        QAccessible::deleteAccessibleInterface(identifier);
    }
}

int RowsAccessible::childCount() const { return view_.layout().lineCount(); }

QAccessibleInterface* RowsAccessible::child(int index) const {
    if (index < 0 || index >= childCount()) {
        return nullptr;
    }
    const auto known = children_.find(index);
    if (known != children_.end()) {
        return QAccessible::accessibleInterface(known->second);
    }
    auto* made = new LineAccessible(view_, index); // owned by QAccessible until deleted there
    children_.emplace(index, QAccessible::registerAccessibleInterface(made));
    return made;
}

int RowsAccessible::indexOfChild(const QAccessibleInterface* child) const {
    const auto* line = dynamic_cast<const LineAccessible*>(child);
    return line ? line->index() : -1;
}

QAccessibleInterface* RowsAccessible::childAt(int x, int y) const {
    const QPointF place = view_.onPane(view_.viewport()->mapFromGlobal(QPoint(x, y)));
    const auto row = view_.layout().rowAt(place);
    return row ? child(view_.layout().lineOfRow(*row)) : nullptr;
}

QAccessibleInterface* RowsAccessible::focusChild() const {
    const auto row = view_.hasFocus() ? view_.currentRow() : std::nullopt;
    return row ? child(view_.layout().lineOfRow(*row)) : nullptr;
}

} // namespace quorl
