#include "quorl/window/HeaderBar.h"

#include <QApplication>
#include <QMouseEvent>
#include <QPainter>
#include <QStyle>
#include <utility>

namespace quorl {

namespace {

constexpr int barHeight = 56;
constexpr int margin = 16;
constexpr int gap = 8;
constexpr QSize chevronSize(14, 18); // with a gap before the text
constexpr QSize lensSize(20, 20);
constexpr double widestBack = 0.5; // of the width
constexpr double backShare = 0.36; // where the title needs the room

/// Points to where the pane below lies.
void drawChevron(QPainter& painter, const QSizeF& size, bool isMirrored) {
    const qreal tip = isMirrored ? size.width() - 2 : 2;
    const qreal back = isMirrored ? tip - 7 : tip + 7;
    painter.drawPolyline(QPolygonF{QPointF(back, 2), QPointF(tip, 9), QPointF(back, 16)});
}

void drawLens(QPainter& painter, const QSizeF& size, bool /*isMirrored*/) {
    const QRectF glass(2, 2, size.width() * 0.6, size.height() * 0.6);
    painter.drawEllipse(glass);
    painter.drawLine(glass.center() + QPointF(4.6, 4.6),
                     QPointF(size.width(), size.height()) - QPointF(2, 2));
}

void drawDots(QPainter& painter, const QSizeF& size, bool /*isMirrored*/) {
    painter.setBrush(painter.pen().color());
    for (const double place : {0.15, 0.5, 0.85}) {
        painter.drawEllipse(QPointF(size.width() / 2, size.height() * place), 0.8, 0.8);
    }
}

void drawDash(QPainter& painter, const QSizeF& size, bool /*isMirrored*/) {
    const qreal middle = size.height() / 2;
    painter.drawLine(QPointF(4, middle), QPointF(size.width() - 4, middle));
}

void drawFrame(QPainter& painter, const QSizeF& size, bool /*isMirrored*/) {
    painter.drawRect(QRectF(QPointF(), size).adjusted(4, 4, -4, -4));
}

void drawCross(QPainter& painter, const QSizeF& size, bool /*isMirrored*/) {
    const QRectF box = QRectF(QPointF(), size).adjusted(4, 4, -4, -4);
    painter.drawLine(box.topLeft(), box.bottomRight());
    painter.drawLine(box.bottomLeft(), box.topRight());
}

FlatButton::Drawing drawingOf(WindowButton button) {
    return button == WindowButton::Minimize   ? drawDash
           : button == WindowButton::Maximize ? drawFrame
                                              : drawCross;
}

void dropAll(std::vector<FlatButton*>& buttons) {
    for (FlatButton* button : std::exchange(buttons, {})) {
        button->hide();
        button->deleteLater(); // it may be the one that was clicked
    }
}

} // namespace

HeaderBar::HeaderBar(WindowScreen& screen, QWidget* parent)
    : QWidget(parent),
      screen_(screen),
      back_(new FlatButton(screen, drawChevron, this)),
      search_(new FlatButton(screen, drawLens, this)),
      menu_(new FlatButton(screen, drawDots, this)),
      label_(new QLabel(this)) {
    back_->setObjectName(QStringLiteral("back"));
    back_->setToolButtonStyle(Qt::ToolButtonTextBesideIcon);
    back_->setIconSize(chevronSize);
    search_->setObjectName(QStringLiteral("search"));
    search_->setIconSize(lensSize);
    search_->setAccessibleName(tr("Search"));
    search_->setToolTip(tr("Search"));
    menu_->setObjectName(QStringLiteral("menu"));
    menu_->setIconSize(lensSize);
    menu_->setAccessibleName(tr("Menu"));
    menu_->setToolTip(tr("Menu"));
    menu_->setPopupMode(QToolButton::InstantPopup);
    label_->setAlignment(Qt::AlignCenter);
    label_->setTextFormat(Qt::PlainText);
    connect(back_, &QToolButton::clicked, this, &HeaderBar::backClicked);
    connect(search_, &QToolButton::clicked, this, &HeaderBar::searchClicked);
}

void HeaderBar::setTitles(const QString& title, const QString& below, Search search) {
    title_ = title;
    below_ = below;
    back_->setVisible(!below.isEmpty());
    search_->setVisible(search == Search::Offered);
    menu_->setVisible(below.isEmpty());
    if (const auto name = tr("Back to %1").arg(below); name != back_->accessibleName()) {
        back_->setAccessibleName(name);
        back_->setToolTip(name);
    }
    if (title != label_->accessibleName()) {
        label_->setAccessibleName(title);
    }
    fitTexts();
}

void HeaderBar::setWindowButtons(const WindowButtons& buttons) {
    if (std::exchange(windowButtons_, buttons) == buttons) {
        return;
    }
    dropAll(windowButtonsAtStart_);
    dropAll(windowButtonsAtEnd_);
    for (const auto button : buttons.atStart) {
        windowButtonsAtStart_.push_back(add(button));
    }
    const std::vector inwards(buttons.atEnd.rbegin(), buttons.atEnd.rend());
    for (const auto button : inwards) {
        windowButtonsAtEnd_.push_back(add(button));
    }
    fitTexts();
}

FlatButton* HeaderBar::add(WindowButton button) {
    auto* added = new FlatButton(screen_, drawingOf(button), this);
    added->setIconSize(lensSize);
    const auto name = button == WindowButton::Minimize   ? tr("Minimize")
                      : button == WindowButton::Maximize ? tr("Maximize or Restore")
                                                         : tr("Close");
    added->setAccessibleName(name);
    added->setToolTip(name);
    connect(added, &QToolButton::clicked, this,
            [this, button] { Q_EMIT windowButtonClicked(button); });
    added->show();
    return added;
}

void HeaderBar::mousePressEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton) {
        pressed_ = event->position().toPoint();
    }
}

void HeaderBar::mouseMoveEvent(QMouseEvent* event) {
    const auto isFar = [](QPoint way) {
        return way.manhattanLength() >= QApplication::startDragDistance();
    };
    if (pressed_ && isFar(event->position().toPoint() - *pressed_)) {
        pressed_.reset(); // the desktop has the mouse from now on
        Q_EMIT dragged();
    }
}

void HeaderBar::mouseReleaseEvent(QMouseEvent* /*event*/) { pressed_.reset(); }

void HeaderBar::mouseDoubleClickEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton) {
        pressed_.reset();
        Q_EMIT doubleClicked();
    }
}

void HeaderBar::resizeEvent(QResizeEvent* event) {
    QWidget::resizeEvent(event);
    fitTexts();
}

void HeaderBar::changeEvent(QEvent* event) {
    QWidget::changeEvent(event);
    if (event->type() == QEvent::FontChange || event->type() == QEvent::LayoutDirectionChange) {
        fitTexts();
    }
}

int HeaderBar::backWidth(const QString& text) const {
    if (below_.isEmpty()) {
        return 0;
    }
    const int forText = text.isEmpty() ? 0 : back_->fontMetrics().horizontalAdvance(text) + gap;
    return std::max(chevronSize.width() + forText + 2 * gap, FlatButton::smallestSide);
}

/// Between the buttons in the middle of the bar, or beside the first where the title is too long
/// for that.
QRect HeaderBar::roomForTitle(int backWidth) const {
    const int start = widthAtStart() + (backWidth > 0 ? backWidth + 2 * gap : margin);
    const int buttons = static_cast<int>(buttonsAtEnd().size());
    const int end = buttons == 0 ? margin : buttons * FlatButton::smallestSide + 2 * gap;
    const int side = std::max(start, end);
    const QRect middle = rect().adjusted(side, 0, -side, 0);
    const bool fits = label_->fontMetrics().horizontalAdvance(title_) <= middle.width();
    return fits ? middle : rect().adjusted(start, 0, -end, 0);
}

/// Of the window's buttons.
int HeaderBar::widthAtStart() const {
    return static_cast<int>(windowButtonsAtStart_.size()) * FlatButton::smallestSide;
}

/// From the edge inwards.
std::vector<QWidget*> HeaderBar::buttonsAtEnd() const {
    std::vector<QWidget*> buttons(windowButtonsAtEnd_.begin(), windowButtonsAtEnd_.end());
    for (QWidget* button : {menu_, search_}) {
        if (!button->isHidden()) {
            buttons.push_back(button);
        }
    }
    return buttons;
}

/// The name of the pane below gives way to the title: the chevron alone says enough.
QString HeaderBar::fittingBackText() const {
    const QFontMetrics metrics = back_->fontMetrics();
    const int beside = chevronSize.width() + 3 * gap;
    for (const double share : {widestBack, backShare}) {
        QString text =
            metrics.elidedText(below_, Qt::ElideRight, static_cast<int>(width() * share) - beside);
        if (label_->fontMetrics().horizontalAdvance(title_) <=
            roomForTitle(backWidth(text)).width()) {
            return text;
        }
    }
    return {};
}

void HeaderBar::place(QWidget& widget, const QRect& leftToRight) const {
    widget.setGeometry(QStyle::visualRect(layoutDirection(), rect(), leftToRight));
}

void HeaderBar::fitTexts() {
    QFont bold = font();
    bold.setBold(true);
    label_->setFont(bold);
    setMinimumHeight(std::max(barHeight, label_->fontMetrics().height() + 2 * gap));
    const QString text = fittingBackText();
    back_->setText(text);
    const int side = FlatButton::smallestSide;
    const int top = (height() - side) / 2;
    int start = gap;
    for (FlatButton* button : windowButtonsAtStart_) {
        place(*button, {start, top, side, side});
        start += side;
    }
    place(*back_, {start, top, backWidth(text), side});
    int end = width() - gap;
    for (QWidget* button : buttonsAtEnd()) {
        end -= side;
        place(*button, {end, top, side, side});
    }
    const QRect room = roomForTitle(backWidth(text));
    label_->setText(label_->fontMetrics().elidedText(title_, Qt::ElideRight, room.width()));
    label_->setToolTip(label_->text() == title_ ? QString() : title_);
    place(*label_, room);
}

} // namespace quorl
