#pragma once

#include <QAccessible>
#include <QAccessibleActionInterface>

#include "quorl/window/rows/RowsView.h"

namespace quorl {

/// One title, row or footer of a pane for screen readers. Says what was drawn last;
/// it is invalid where the pane had fewer lines then. Main thread.
class LineAccessible final : public QAccessibleInterface, public QAccessibleActionInterface {
  public:
    /// `view` outlives this object.
    LineAccessible(RowsView& view, int index) : view_(view), index_(index) {}

    /// Counted from the top of the pane.
    [[nodiscard]] int index() const { return index_; }

    [[nodiscard]] bool isValid() const override;
    [[nodiscard]] QObject* object() const override;
    [[nodiscard]] QAccessibleInterface* parent() const override;
    [[nodiscard]] QAccessibleInterface* child(int index) const override;
    [[nodiscard]] int childCount() const override;
    [[nodiscard]] int indexOfChild(const QAccessibleInterface* child) const override;
    [[nodiscard]] QAccessibleInterface* childAt(int x, int y) const override;
    [[nodiscard]] QAccessible::Role role() const override;
    [[nodiscard]] QAccessible::State state() const override;
    [[nodiscard]] QRect rect() const override;
    [[nodiscard]] QString text(QAccessible::Text kind) const override;
    void setText(QAccessible::Text kind, const QString& text) override;
    [[nodiscard]] void* interface_cast(QAccessible::InterfaceType type) override;

    [[nodiscard]] QStringList actionNames() const override;
    void doAction(const QString& name) override;
    [[nodiscard]] QStringList keyBindingsForAction(const QString& name) const override;

  private:
    [[nodiscard]] RowsLayout::Line line() const;

    /// The row's cell; null for a title or a footer.
    [[nodiscard]] std::shared_ptr<UITableViewCell> cell() const;

    [[nodiscard]] QString textOfRow(const RowTexts& texts, QAccessible::Text kind) const;

    /// Which of how many rows it is.
    [[nodiscard]] QString position() const;

    RowsView& view_;
    const int index_;
};

} // namespace quorl
