#pragma once

#include <QColor>
#include <QPalette>

namespace quorl {

/// What panes are painted with.
struct PaneColors {
    QColor page;      ///< behind the groups
    QColor card;      ///< behind the rows of a group
    QColor text;      ///< titles of rows
    QColor secondary; ///< values, titles and footers of groups
    QColor faint;     ///< marks that only guide the eye
    QColor separator; ///< between rows
    QColor notice;    ///< behind notices
    QColor highlight; ///< over a row that is touched
    QColor tint;      ///< what can be tapped, and what is chosen

    /// The colours that go with a palette, light or dark.
    [[nodiscard]] static PaneColors of(const QPalette& palette, const QColor& tint);
};

/// A dark palette, for where the desktop does not give one.
[[nodiscard]] QPalette darkPalette();

} // namespace quorl
