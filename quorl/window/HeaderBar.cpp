#include "quorl/window/HeaderBar.h"

#include <QEvent>
#include <QPainter>
#include <QStyle>

namespace quorl {

namespace {

constexpr int barHeight = 56;
constexpr int margin = 16;
constexpr int gap = 8;
constexpr int smallestButton = 44;
constexpr QSize chevronSize(14, 18); // with a gap before the text
constexpr double backShare = 0.36;   // of the width, at the most

/// Points to where the pane below lies.
QIcon chevron(const QColor& color, Qt::LayoutDirection direction, qreal scale) {
    constexpr QSize size = chevronSize;
    QPixmap picture(size * scale);
    picture.setDevicePixelRatio(scale);
    picture.fill(Qt::transparent);
    QPainter painter(&picture);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(QPen(color, 2.4, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
    const bool isMirrored = direction == Qt::RightToLeft;
    const qreal tip = isMirrored ? size.width() - 2 : 2;
    const qreal back = isMirrored ? tip - 7 : tip + 7;
    painter.drawPolyline(QPolygonF{QPointF(back, 2), QPointF(tip, 9), QPointF(back, 16)});
    return picture;
}

} // namespace

HeaderBar::HeaderBar(const QColor& tint, QWidget* parent)
    : QWidget(parent), back_(new QToolButton(this)), label_(new QLabel(this)), tint_(tint) {
    setMinimumHeight(barHeight);
    back_->setObjectName(QStringLiteral("back"));
    back_->setAutoRaise(true);
    back_->setToolButtonStyle(Qt::ToolButtonTextBesideIcon);
    back_->setIconSize(chevronSize);
    label_->setAlignment(Qt::AlignCenter);
    label_->setTextFormat(Qt::PlainText);
    connect(back_, &QToolButton::clicked, this, &HeaderBar::backClicked);
}

void HeaderBar::setTitles(const QString& title, const QString& below) {
    title_ = title;
    below_ = below;
    back_->setVisible(!below.isEmpty());
    back_->setAccessibleName(tr("Back to %1").arg(below));
    label_->setAccessibleName(title);
    fitTexts();
}

void HeaderBar::resizeEvent(QResizeEvent* event) {
    QWidget::resizeEvent(event);
    fitTexts();
}

void HeaderBar::changeEvent(QEvent* event) {
    QWidget::changeEvent(event);
    if (event->type() == QEvent::FontChange || event->type() == QEvent::LayoutDirectionChange ||
        event->type() == QEvent::PaletteChange) {
        fitTexts();
    }
}

void HeaderBar::dress() {
    QPalette colors = palette();
    colors.setColor(QPalette::ButtonText, tint_);
    back_->setPalette(colors);
    back_->setIcon(chevron(tint_, layoutDirection(), devicePixelRatioF()));
    QFont bold = font();
    bold.setBold(true);
    label_->setFont(bold);
}

/// The title is in the middle of the bar, or beside the button where it is too long for that.
void HeaderBar::fitTexts() {
    dress();
    const bool goesBack = !below_.isEmpty();
    const int widest = goesBack ? static_cast<int>(width() * backShare) : 0;
    const int forText = widest - back_->iconSize().width() - 2 * gap;
    back_->setText(back_->fontMetrics().elidedText(below_, Qt::ElideRight, forText));
    const int backWidth =
        goesBack ? std::clamp(back_->sizeHint().width(), smallestButton, widest) : 0;
    const QRect button(gap, (height() - smallestButton) / 2, backWidth, smallestButton);
    back_->setGeometry(QStyle::visualRect(layoutDirection(), rect(), button));
    const int side = goesBack ? backWidth + 2 * gap : margin;
    QRect middle = rect().adjusted(side, 0, -side, 0);
    if (label_->fontMetrics().horizontalAdvance(title_) > middle.width()) {
        middle = QStyle::visualRect(layoutDirection(), rect(), rect().adjusted(side, 0, -gap, 0));
    }
    label_->setText(label_->fontMetrics().elidedText(title_, Qt::ElideRight, middle.width()));
    label_->setGeometry(middle);
}

} // namespace quorl
