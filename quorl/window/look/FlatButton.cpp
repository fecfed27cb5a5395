#include "quorl/window/look/FlatButton.h"

#include <QEvent>
#include <QStyleOptionToolButton>
#include <QStylePainter>

#include "quorl/window/look/TouchState.h"

namespace quorl {

namespace {

constexpr qreal radius = 8;
constexpr qreal lineWidth = 2.2;

} // namespace

FlatButton::FlatButton(WindowScreen& screen, Drawing drawing, QWidget* parent)
    : QToolButton(parent), screen_(screen), drawing_(drawing) {
    setAutoRaise(true);
    setMinimumSize(smallestSide, smallestSide);
    connect(&screen, &WindowScreen::lookChanged, this, &FlatButton::dress);
    connect(&screen.lastInput(), &LastInput::changed, this, qOverload<>(&QWidget::update));
    dress();
}

void FlatButton::changeEvent(QEvent* event) {
    QToolButton::changeEvent(event);
    if (event->type() == QEvent::PaletteChange || event->type() == QEvent::LayoutDirectionChange) {
        dress();
    }
}

void FlatButton::dress() {
    const QColor tint = PaneColors::of(parentWidget()->palette(), screen_.look()).tint;
    QPalette colors; // all but this follows the parent
    colors.setColor(QPalette::ButtonText, tint);
    setPalette(colors);
    if (!drawing_) {
        return;
    }
    const qreal scale = devicePixelRatioF();
    QPixmap picture(iconSize() * scale);
    picture.setDevicePixelRatio(scale);
    picture.fill(Qt::transparent);
    QPainter painter(&picture);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(QPen(tint, lineWidth, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
    drawing_(painter, iconSize(), layoutDirection() == Qt::RightToLeft);
    setIcon(picture);
}

void FlatButton::paintEvent(QPaintEvent* /*event*/) {
    QStylePainter painter(this);
    const PaneColors colors = PaneColors::of(palette(), screen_.look());
    const bool isKeyed = screen_.lastInput().kind() == LastInput::Kind::Keys;
    const TouchState state{underMouse() && !isDown(), isDown() ? 1.0 : 0.0, hasFocus() && isKeyed};
    state.paintGround(painter, rect(), radius, colors);
    QStyleOptionToolButton option;
    initStyleOption(&option);
    option.state &= ~(QStyle::State_MouseOver | QStyle::State_Sunken | QStyle::State_HasFocus);
    painter.drawControl(QStyle::CE_ToolButtonLabel, option);
    state.paintRing(painter, rect(), radius - 2, colors);
}

} // namespace quorl
