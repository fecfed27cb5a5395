#include "quorl/window/look/PaneColors.h"

namespace quorl {

namespace {

QColor mixed(const QColor& color, const QColor& ground, double share) {
    const auto mix = [share](float one, float other) {
        return static_cast<float>(one * share + other * (1 - share));
    };
    return QColor::fromRgbF(mix(color.redF(), ground.redF()), mix(color.greenF(), ground.greenF()),
                            mix(color.blueF(), ground.blueF()));
}

} // namespace

PaneColors PaneColors::of(const QPalette& palette, const QColor& tint) {
    // Some dark palettes have the base above the window, some below: rows are the brighter one.
    QColor page = palette.color(QPalette::Window);
    QColor card = palette.color(QPalette::Base);
    if (card.lightnessF() < page.lightnessF()) {
        std::swap(page, card);
    }
    const QColor text = palette.color(QPalette::WindowText);
    return {.page = page,
            .card = card,
            .text = text,
            .secondary = mixed(text, card, 0.62),
            .faint = mixed(text, card, 0.4),
            .separator = mixed(text, card, 0.14),
            .notice = mixed(tint, card, 0.16),
            .highlight = mixed(text, card, 0.12),
            .tint = tint};
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
