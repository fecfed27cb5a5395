#pragma once

#include <QFont>
#include <QPalette>
#include <QVariant>
#include <optional>

#include "quorl/window/look/Look.h"

namespace quorl {

/// What the desktop says of how things are to look, as far as it says anything. Pure.
struct Appearance {
    enum class Scheme { Any, Dark, Light };

    Scheme scheme = Scheme::Any;
    std::optional<QColor> accent;
    bool isContrastHigh = false;
    bool isMotionReduced = false;
    bool areAnimationsEnabled = true; ///< what older desktops say of motion
    QString fontName;                 ///< with its size in points at the end; empty for nothing
    double textScale = 1;
    std::optional<QString> windowButtons; ///< as in `Look`

    /// Takes a setting of the desktop's portal; one that nobody here knows, or of a value that
    /// makes no sense, counts as not being said.
    void take(const QString& group, const QString& key, const QVariant& value);

    /// `usual` and what the desktop says of it.
    [[nodiscard]] Look look(const Look& usual) const;
    [[nodiscard]] QPalette palette(const QPalette& usual) const;
    [[nodiscard]] QFont font(const QFont& usual) const;

    [[nodiscard]] bool operator==(const Appearance&) const = default;
};

} // namespace quorl
