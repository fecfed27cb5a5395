#include "quorl/window/look/PaneColors.h"

#include <algorithm>
#include <array>
#include <cmath>

#include "quorl/app/PaneScreen.h"

namespace quorl {

namespace {

/// What contrasts are asked for, and how much of the text's colour is in the others.
struct Demands {
    double text;
    double mark;
    double edge;
    double secondaryShare;
    double separatorShare;
};

constexpr Demands standard{4.6, 3.1, 1.25, 0.62, 0.14};
constexpr Demands high{7.1, 4.6, 4.6, 0.9, 0.6};

QColor mixed(const QColor& color, const QColor& ground, double share) {
    const auto mix = [share](float one, float other) {
        return static_cast<float>(one * share + other * (1 - share));
    };
    const QColor exact =
        QColor::fromRgbF(mix(color.redF(), ground.redF()), mix(color.greenF(), ground.greenF()),
                         mix(color.blueF(), ground.blueF()));
    return exact.rgb(); // as a screen shows it
}

using LinearParts = std::array<double, 256>;

LinearParts linearParts() {
    LinearParts parts{};
    for (std::size_t at = 0; at < parts.size(); ++at) {
        const double part = static_cast<double>(at) / (parts.size() - 1);
        parts.at(at) = part <= 0.04045 ? part / 12.92 : std::pow((part + 0.055) / 1.055, 2.4);
    }
    return parts;
}

double luminance(const QColor& color) {
    static const LinearParts parts = linearParts();
    const auto linear = [](int part) { return parts.at(static_cast<std::size_t>(part)); };
    return 0.2126 * linear(color.red()) + 0.7152 * linear(color.green()) +
           0.0722 * linear(color.blue());
}

using Grounds = std::vector<QColor>;

double lowestContrast(const QColor& color, const Grounds& grounds) {
    double lowest = 21;
    for (const QColor& ground : grounds) {
        lowest = std::min(lowest, PaneColors::contrast(color, ground));
    }
    return lowest;
}

/// `color`, as far towards `extreme` as it takes to be told from all grounds.
QColor readable(const QColor& color, const QColor& extreme, const Grounds& grounds,
                double contrast) {
    constexpr int steps = 64;
    for (int step = 0; step < steps; ++step) {
        const QColor candidate = mixed(extreme, color, static_cast<double>(step) / steps);
        if (lowestContrast(candidate, grounds) >= contrast) {
            return candidate;
        }
    }
    return extreme;
}

QColor blackOrWhite(const Grounds& grounds) {
    const QColor black = Qt::black;
    const QColor white = Qt::white;
    return lowestContrast(black, grounds) > lowestContrast(white, grounds) ? black : white;
}

} // namespace

double PaneColors::contrast(const QColor& one, const QColor& other) {
    const auto [dark, bright] = std::minmax({luminance(one), luminance(other)});
    return (bright + 0.05) / (dark + 0.05);
}

PaneColors PaneColors::of(const QPalette& palette, const Look& look) {
    const Demands& demands = look.contrast == Contrast::High ? high : standard;
    PaneColors colors;
    // Some dark palettes have the base above the window, some below: rows are the brighter one.
    colors.page = palette.color(QPalette::Window);
    colors.card = palette.color(QPalette::Base);
    if (colors.card.lightnessF() < colors.page.lightnessF()) {
        std::swap(colors.page, colors.card);
    }
    const QColor ink = palette.color(QPalette::WindowText);
    colors.hover = mixed(ink, colors.card, 0.05);
    colors.pressed = mixed(ink, colors.card, 0.1);
    colors.notice = mixed(look.accent, colors.card, 0.12);
    const Grounds grounds{colors.page, colors.card, colors.hover, colors.pressed, colors.notice};
    const QColor extreme = blackOrWhite(grounds);
    colors.text = readable(ink, extreme, grounds, demands.text);
    colors.secondary =
        readable(mixed(ink, colors.card, demands.secondaryShare), extreme, grounds, demands.text);
    colors.tint = readable(look.accent, extreme, grounds, demands.text);
    colors.mark = readable(mixed(ink, colors.card, 0.4), extreme, grounds, demands.mark);
    colors.edge = readable(mixed(ink, colors.card, demands.separatorShare), extreme,
                           {colors.page, colors.card}, demands.edge);
    colors.separator = mixed(ink, colors.card, demands.separatorShare);
    return colors;
}

QColor PaneColors::knobOn(const QColor& track) const {
    const QColor white = Qt::white;
    return contrast(white, track) >= standard.mark ? white : blackOrWhite({track});
}

QColor PaneColors::named(const std::optional<UIColor>& name, const QColor& otherwise) const {
    if (name == PaneScreen::tintName) {
        return tint;
    }
    const QColor color = name ? QColor(QString::fromStdString(*name)) : QColor();
    return color.isValid() ? color : otherwise;
}

QPalette darkPalette() {
    QPalette palette(QColor(0x2b, 0x2b, 0x2f), QColor(0x16, 0x16, 0x19));
    palette.setColor(QPalette::Base, QColor(0x26, 0x26, 0x2a));
    palette.setColor(QPalette::WindowText, QColor(0xf2, 0xf2, 0xf4));
    palette.setColor(QPalette::Text, QColor(0xf2, 0xf2, 0xf4));
    palette.setColor(QPalette::ButtonText, QColor(0xf2, 0xf2, 0xf4));
    return palette;
}

} // namespace quorl
