#include "quorl/window/desktop/Appearance.h"

#include <QApplication>
#include <QDBusArgument>
#include <QFontDatabase>
#include <QFontInfo>
#include <QStyle>
#include <algorithm>
#include <array>
#include <cmath>

#include "quorl/window/look/PaneColors.h"

namespace quorl {

namespace {

constexpr qreal smallestPoints = 4;
constexpr qreal largestPoints = 72;

/// Red, green and blue, each from 0 to 1; other numbers are how a desktop says that there is none.
std::optional<QColor> colorIn(const QVariant& value) {
    const auto argument = value.value<QDBusArgument>();
    if (argument.currentSignature() != QStringLiteral("(ddd)")) {
        return std::nullopt;
    }
    std::array<double, 3> parts{};
    argument.beginStructure();
    argument >> parts[0] >> parts[1] >> parts[2];
    argument.endStructure();
    const bool isColor =
        std::all_of(parts.begin(), parts.end(), [](double part) { return part >= 0 && part <= 1; });
    return isColor ? std::optional(QColor::fromRgbF(static_cast<float>(parts[0]),
                                                    static_cast<float>(parts[1]),
                                                    static_cast<float>(parts[2])))
                   : std::nullopt;
}

Appearance::Scheme schemeIn(const QVariant& value) {
    switch (value.toUInt()) {
    case 1:
        return Appearance::Scheme::Dark;
    case 2:
        return Appearance::Scheme::Light;
    default:
        return Appearance::Scheme::Any;
    }
}

double scaleIn(const QVariant& value) {
    const double scale = value.toDouble();
    return std::isfinite(scale) && scale >= 0.5 && scale <= 3 ? scale : 1;
}

bool isDark(const QPalette& palette) {
    return palette.color(QPalette::Window).lightnessF() <
           palette.color(QPalette::WindowText).lightnessF();
}

} // namespace

void Appearance::take(const QString& group, const QString& key, const QVariant& value) {
    const QString name = group + u' ' + key;
    if (name == QStringLiteral("org.freedesktop.appearance color-scheme")) {
        scheme = schemeIn(value);
    } else if (name == QStringLiteral("org.freedesktop.appearance accent-color")) {
        accent = colorIn(value);
    } else if (name == QStringLiteral("org.freedesktop.appearance contrast")) {
        isContrastHigh = value.toUInt() == 1;
    } else if (name == QStringLiteral("org.freedesktop.appearance reduced-motion")) {
        isMotionReduced = value.toUInt() == 1;
    } else if (name == QStringLiteral("org.gnome.desktop.interface enable-animations")) {
        areAnimationsEnabled = value.typeId() != QMetaType::Bool || value.toBool();
    } else if (name == QStringLiteral("org.gnome.desktop.interface font-name")) {
        fontName = value.toString();
    } else if (name == QStringLiteral("org.gnome.desktop.interface text-scaling-factor")) {
        textScale = scaleIn(value);
    } else if (name == QStringLiteral("org.gnome.desktop.wm.preferences button-layout")) {
        const bool isText = value.typeId() == QMetaType::QString;
        windowButtons = isText ? std::optional(value.toString()) : std::nullopt;
    }
}

Look Appearance::look(const Look& usual) const {
    Look look = usual;
    look.accent = accent.value_or(usual.accent);
    look.contrast = isContrastHigh ? Contrast::High : usual.contrast;
    look.motion = isMotionReduced || !areAnimationsEnabled ? Motion::Reduced : usual.motion;
    look.windowButtons = windowButtons.value_or(usual.windowButtons);
    return look;
}

QPalette Appearance::palette(const QPalette& usual) const {
    if (scheme == Scheme::Any || (scheme == Scheme::Dark) == isDark(usual)) {
        return usual;
    }
    return scheme == Scheme::Dark ? darkPalette() : QApplication::style()->standardPalette();
}

QFont Appearance::font(const QFont& usual) const {
    QFont font = usual;
    const auto space = fontName.lastIndexOf(u' ');
    const double points = fontName.mid(space + 1).toDouble();
    const bool hasSize = points >= smallestPoints && points <= largestPoints;
    if (const QString family = fontName.left(space); hasSize && QFontDatabase::hasFamily(family)) {
        font.setFamilies({family});
    }
    const double size = hasSize ? points : QFontInfo(usual).pointSizeF();
    if (hasSize || textScale != 1) {
        font.setPointSizeF(size * textScale);
    }
    return font;
}

} // namespace quorl
