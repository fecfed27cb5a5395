#include "quorl/window/look/WindowScreen.h"

#include <QApplication>
#include <QFontInfo>
#include <QFontMetricsF>
#include <QStyle>
#include <cmath>

namespace quorl {

namespace {

constexpr qreal smallestRowHeight = 44;
constexpr qreal rowPadding = 14;
constexpr qreal smallestTextHeight = 15; // pixels of the font's size
constexpr int smallestSmallTextHeight = 13;

qreal upToPixel(qreal length, qreal scale) { return std::ceil(length * scale - 1e-6) / scale; }

} // namespace

WindowScreen::WindowScreen() {
    setFont(QGuiApplication::font());
    if (QApplication::style()->styleHint(QStyle::SH_Widget_Animation_Duration) == 0) {
        look_.motion = Motion::Reduced;
    }
}

void WindowScreen::setLook(const Look& look) {
    if (look != look_) {
        look_ = look;
        Q_EMIT lookChanged();
    }
}

void WindowScreen::setFont(const QFont& applicationFont) {
    font_ = applicationFont;
    if (QFontInfo(font_).pixelSize() < smallestTextHeight) {
        font_.setPixelSize(static_cast<int>(smallestTextHeight));
    }
}

QFont WindowScreen::headingFont() const {
    QFont font = smallFont();
    font.setBold(true);
    return font;
}

QFont WindowScreen::smallFont() const {
    QFont font = font_;
    font.setPixelSize(std::max(QFontInfo(font_).pixelSize() * 7 / 8, smallestSmallTextHeight));
    return font;
}

qreal WindowScreen::rowHeight() const {
    const qreal wanted =
        std::max(smallestRowHeight, 2 * QFontMetricsF(font_).height() + rowPadding);
    return upToPixel(wanted, scale_);
}

void WindowScreen::setGeometry(qreal rowWidth, qreal scale) {
    rowWidth_ = rowWidth;
    scale_ = scale;
}

CGSize WindowScreen::rowSize() const {
    return {static_cast<CGFloat>(rowWidth_), static_cast<CGFloat>(rowHeight())};
}

CGSize WindowScreen::sizeOfText(const UILabel& label) const {
    if (!label.text() || label.text()->empty()) {
        return {};
    }
    const QFontMetricsF metrics(font_);
    const qreal width = metrics.horizontalAdvance(QString::fromStdString(*label.text()));
    return {static_cast<CGFloat>(upToPixel(width, scale_)),
            static_cast<CGFloat>(upToPixel(metrics.height(), scale_))};
}

void WindowScreen::layOutLabels(UITableViewCell& cell) {
    PaneScreen::layOutLabels(cell);
    for (UILabel* label : {&cell.textLabel(), &cell.detailTextLabel()}) {
        label->setFrame(UIRectIntegralWithScale(label->frame(), scale()));
    }
}

} // namespace quorl
