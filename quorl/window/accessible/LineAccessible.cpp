#include "quorl/window/accessible/LineAccessible.h"

#include <QCoreApplication>

#include "quorl/content/ButtonCell.h"
#include "quorl/content/SwitchCell.h"

namespace quorl {

bool LineAccessible::isValid() const { return index_ < view_.layout().lineCount(); }

QObject* LineAccessible::object() const { return nullptr; }

QAccessibleInterface* LineAccessible::parent() const {
    return QAccessible::queryAccessibleInterface(&view_);
}

QAccessibleInterface* LineAccessible::child(int /*index*/) const { return nullptr; }

int LineAccessible::childCount() const { return 0; }

int LineAccessible::indexOfChild(const QAccessibleInterface* /*child*/) const { return -1; }

QAccessibleInterface* LineAccessible::childAt(int /*x*/, int /*y*/) const { return nullptr; }

RowsLayout::Line LineAccessible::line() const { return view_.layout().line(index_); }

std::shared_ptr<UITableViewCell> LineAccessible::cell() const {
    const auto line = this->line();
    return isValid() && line.kind == RowsLayout::LineKind::Row
               ? view_.content().cellAnywhere(line.row)
               : nullptr;
}

QAccessible::Role LineAccessible::role() const {
    switch (line().kind) {
    case RowsLayout::LineKind::Title:
        return QAccessible::Heading;
    case RowsLayout::LineKind::Footer:
        return QAccessible::Paragraph;
    case RowsLayout::LineKind::Row:
        break;
    }
    const auto cell = this->cell();
    if (cell && dynamic_cast<const SwitchCell*>(cell.get())) {
        return QAccessible::CheckBox;
    }
    const bool isButton =
        cell && (dynamic_cast<const ButtonCell*>(cell.get()) ||
                 cell->accessoryType() == UITableViewCellAccessoryType::DisclosureIndicator);
    return isButton ? QAccessible::Button : QAccessible::ListItem;
}

QAccessible::State LineAccessible::state() const {
    QAccessible::State state;
    if (!isValid()) {
        state.invalid = true;
        return state;
    }
    const QRectF place = view_.onViewport(line().rect);
    const bool isSeen = view_.isVisible() && place.intersects(QRectF(view_.viewport()->rect()));
    state.offscreen = !isSeen;
    state.invisible = !isSeen; // only that keeps a line from being told as showing
    if (const auto cell = this->cell()) {
        const bool isCurrent = view_.currentRow() == line().row;
        state.focusable = true;
        state.focused = isCurrent && view_.hasFocus();
        state.checkable = role() != QAccessible::Button;
        state.checked = textsOf(*cell).isChecked;
        const auto marked = view_.markedRow();
        state.selectable = marked.has_value();
        state.selected = marked == line().row;
    } else {
        state.readOnly = true;
    }
    return state;
}

QRect LineAccessible::rect() const {
    const QRect onViewport = view_.onViewport(line().rect).toAlignedRect();
    return {view_.viewport()->mapToGlobal(onViewport.topLeft()), onViewport.size()};
}

QString LineAccessible::text(QAccessible::Text kind) const {
    if (!isValid()) {
        return {};
    }
    if (const auto cell = this->cell()) {
        return textOfRow(textsOf(*cell), kind);
    }
    const auto& section = view_.content().sections()[line().section];
    const auto& text = line().kind == RowsLayout::LineKind::Title ? section.title : section.footer;
    return kind == QAccessible::Name ? QString::fromStdString(text.value_or("")) : QString();
}

QString LineAccessible::textOfRow(const RowTexts& texts, QAccessible::Text kind) const {
    switch (kind) {
    case QAccessible::Name:
        return texts.title;
    case QAccessible::Value:
        return texts.value;
    case QAccessible::Description:
        return texts.value + (texts.value.isEmpty() ? QString() : QStringLiteral(", ")) +
               position();
    default:
        return {};
    }
}

QString LineAccessible::position() const {
    return QCoreApplication::translate("LineAccessible", "%1 of %2")
        .arg(line().row + 1)
        .arg(view_.layout().rowCount());
}

void LineAccessible::setText(QAccessible::Text /*kind*/, const QString& /*text*/) {}

void* LineAccessible::interface_cast(QAccessible::InterfaceType type) {
    return type == QAccessible::ActionInterface ? static_cast<QAccessibleActionInterface*>(this)
                                                : nullptr;
}

QStringList LineAccessible::actionNames() const {
    return cell() ? QStringList{pressAction(), setFocusAction()} : QStringList();
}

void LineAccessible::doAction(const QString& name) {
    if (!cell() || !view_.content().isCurrent()) {
        return;
    }
    view_.setCurrentRow(line().row);
    if (name == setFocusAction()) {
        view_.setFocus(Qt::OtherFocusReason);
    } else if (name == pressAction()) {
        view_.tap(line().row);
    }
}

QStringList LineAccessible::keyBindingsForAction(const QString& /*name*/) const { return {}; }

} // namespace quorl
