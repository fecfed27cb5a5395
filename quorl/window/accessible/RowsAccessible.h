#pragma once

#include <QAccessibleWidget>

#include "quorl/window/rows/RowsView.h"

namespace quorl {

/// A pane for screen readers: a list whose children are the titles, rows and footers, from top to
/// bottom. Main thread.
class RowsAccessible final : public QAccessibleWidget {
  public:
    /// Has every `RowsView` of the process read this way; more than once does no harm.
    static void install();

    explicit RowsAccessible(RowsView& view);
    ~RowsAccessible() override;

    [[nodiscard]] int childCount() const override;
    [[nodiscard]] QAccessibleInterface* child(int index) const override;
    [[nodiscard]] int indexOfChild(const QAccessibleInterface* child) const override;
    [[nodiscard]] QAccessibleInterface* childAt(int x, int y) const override;
    [[nodiscard]] QAccessibleInterface* focusChild() const override;

  private:
    RowsView& view_;
    mutable std::map<int, QAccessible::Id> children_; ///< made when asked for
};

} // namespace quorl
