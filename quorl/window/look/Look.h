#pragma once

#include <QColor>
#include <QString>

namespace quorl {

enum class Contrast { Standard, High };

/// Whether what changes may move on the screen, or is to change at once.
enum class Motion { Full, Reduced };

/// How a person wants things to look, apart from the palette and the font, which every toolkit
/// knows.
struct Look {
    QColor accent = QColor(0x5b, 0x6e, 0xf5); ///< of what can be tapped, as the person chose it
    Contrast contrast = Contrast::Standard;
    Motion motion = Motion::Full;
    /// Of the title bars that are left to apps; see `windowButtonsIn`.
    QString windowButtons = QStringLiteral(":close");

    [[nodiscard]] bool operator==(const Look&) const = default;
};

} // namespace quorl
