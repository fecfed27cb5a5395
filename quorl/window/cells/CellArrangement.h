#pragma once

#include <QFont>
#include <QRectF>
#include <QStringList>

#include "platform/UserInterface.h"

namespace quorl {

/// How the texts of a cell are written into its row, in points from the row's left top corner, for
/// people who read from left to right. They stand where the cell laid them out as long as they are
/// whole there; else a name takes two lines, or has its value below it. It is shortened only where
/// nothing of that helps.
struct CellArrangement {
    struct Text {
        QStringList lines; ///< one or two; none for no text
        QRectF place;
    };

    Text title;
    Text value;
    bool isStacked = false; ///< the value is below the title, and begins where that begins
    bool isWhole = true;    ///< nothing is shortened

    /// `cell` has been laid out; `row` is the size of its row.
    [[nodiscard]] static CellArrangement of(const UITableViewCell& cell, const QSizeF& row,
                                            const QFont& font);
};

} // namespace quorl
