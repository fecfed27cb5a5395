#pragma once

#include <QPalette>

#include "platform/UserInterface.h"
#include "quorl/window/look/Look.h"

namespace quorl {

/// What panes are painted with. On everything that it is painted on, text has at least the contrast
/// of 4.5 to 1 that WCAG asks for at level AA, and a mark that says something 3 to 1; with high
/// contrast 7 and 4.5.
struct PaneColors {
    QColor page;      ///< behind the groups
    QColor card;      ///< behind the rows of a group
    QColor hover;     ///< behind a row under the pointer
    QColor pressed;   ///< behind a row that is touched
    QColor notice;    ///< behind notices
    QColor text;      ///< titles of rows and groups
    QColor secondary; ///< values of rows, footers of groups
    QColor tint;      ///< what can be tapped, what is chosen, and the ring around the focus
    QColor mark;      ///< chevrons, and the track of a switch that is off
    QColor edge;      ///< around cards
    QColor separator; ///< between rows

    /// The colours that go with a palette, light or dark.
    [[nodiscard]] static PaneColors of(const QPalette& palette, const Look& look);

    /// The knob of a switch on a track of this colour.
    [[nodiscard]] QColor knobOn(const QColor& track) const;

    /// What a pane asked for by name or as "#rrggbb"; `otherwise` where it asked for nothing, or
    /// for a colour that nobody knows.
    [[nodiscard]] QColor named(const std::optional<UIColor>& name, const QColor& otherwise) const;

    /// The share of black and white between two colours: from 1 to 21.
    [[nodiscard]] static double contrast(const QColor& one, const QColor& other);
};

/// A dark palette, for where the desktop does not give one.
[[nodiscard]] QPalette darkPalette();

} // namespace quorl
