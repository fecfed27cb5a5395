#include "quorl/window/rows/RowsView.h"

#include <QAccessible>
#include <QApplication>
#include <QKeyEvent>
#include <QPainter>
#include <QPainterPath>
#include <QScrollBar>
#include <QScroller>
#include <QStyle>
#include <cmath>

#include "quorl/window/accessible/RowsAccessible.h"
#include "quorl/window/cells/CellPainter.h"
#include "quorl/window/cells/WrappedText.h"

namespace quorl {

namespace {

constexpr qreal pageMargin = 16;
constexpr qreal widestCard = 640;
constexpr qreal cardRadius = 10;
constexpr qreal separatorIndent = 16;
constexpr int fadeDuration = 250;      // milliseconds
constexpr int highlightDuration = 350; // milliseconds

void prepare(QVariantAnimation& animation) {
    animation.setStartValue(1.0);
    animation.setEndValue(0.0);
}

} // namespace

RowsView::RowsView(std::unique_ptr<PaneContent> content, WindowScreen& screen, QWidget* parent)
    : QAbstractScrollArea(parent),
      content_(std::move(content)),
      screen_(screen),
      colors_(PaneColors::of(palette(), QColor(QString::fromStdString(screen.tintColor())))) {
    RowsAccessible::install();
    setFrameShape(QFrame::NoFrame);
    setFocusPolicy(Qt::StrongFocus);
    setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    QScroller::grabGesture(viewport(), QScroller::TouchGesture);
    prepare(highlight_);
    prepare(fade_);
    connect(&highlight_, &QVariantAnimation::valueChanged, viewport(),
            qOverload<>(&QWidget::update));
    connect(&highlight_, &QVariantAnimation::finished, this, &RowsView::endHighlight);
    connect(&fade_, &QVariantAnimation::valueChanged, viewport(), qOverload<>(&QWidget::update));
    connect(&fade_, &QVariantAnimation::finished, this, [this] { fadingRows_.clear(); });
    connectScreen();
}

void RowsView::connectScreen() {
    connect(&screen_, &PaneScreen::rowsWillFade, this, &RowsView::fadeRows);
    connect(&screen_, &PaneScreen::rowWillBeDeselected, this,
            [this](const UITableView& table, const NSIndexPath& path, bool animated) {
                if (content_->row(table, path) == highlightedRow_) {
                    animated ? fadeHighlight() : endHighlight();
                }
            });
}

void RowsView::draw() {
    if (press_ && !content_->isCurrent()) {
        releasePress(); // the finger came down on another row
    }
    layOut(); // the screen's geometry is that of this view before cells are laid out
    drawRows();
    layOut();
    tellAccessibility();
    viewport()->update();
}

void RowsView::drawRows() {
    const qreal rowHeight = screen_.rowHeight();
    // Also right for a pane that has more rows now than when it was laid out.
    const auto onScreen = static_cast<NSInteger>(std::ceil(viewport()->height() / rowHeight)) + 1;
    content_->draw(layout_.firstRowBelow(verticalScrollBar()->value()), onScreen);
}

void RowsView::layOut() {
    const qreal scale = devicePixelRatioF();
    const qreal available = viewport()->width();
    const qreal width = std::clamp<qreal>(available - 2 * pageMargin, 1, widestCard);
    const qreal left = std::round((available - width) / 2 * scale) / scale;
    const qreal rowWidth = std::floor(width * scale) / scale;
    screen_.setGeometry(rowWidth, scale);
    const QFont font = smallFont();
    layout_ = RowsLayout(content_->sections(), left, rowWidth, screen_.rowHeight(),
                         [&font](const std::string& text, qreal textWidth) {
                             const auto lines =
                                 wrappedLines(QString::fromStdString(text), font, textWidth);
                             return heightOfLines(lines, font);
                         });
    const int beyond = static_cast<int>(layout_.height()) - viewport()->height();
    verticalScrollBar()->setRange(0, std::max(beyond, 0));
    verticalScrollBar()->setPageStep(viewport()->height());
    verticalScrollBar()->setSingleStep(static_cast<int>(screen_.rowHeight() / 2));
}

QFont RowsView::smallFont() const {
    QFont font = screen_.font();
    font.setPixelSize(std::max(QFontInfo(font).pixelSize() * 7 / 8, 13));
    return font;
}

void RowsView::tellAccessibility() {
    std::map<NSInteger, RowTexts> texts;
    NSInteger row = layout_.firstRowBelow(verticalScrollBar()->value());
    for (auto cell = content_->cell(row); cell; cell = content_->cell(++row)) {
        texts.emplace(row, textsOf(*cell));
        if (const auto before = told_.find(row); before != told_.end()) {
            tellChanges(layout_.lineOfRow(row), before->second, texts.at(row));
        }
    }
    told_ = std::move(texts);
}

void RowsView::tellChanges(int line, const RowTexts& before, const RowTexts& now) {
    const auto tell = [line](QAccessibleEvent&& event) {
        event.setChild(line);
        QAccessible::updateAccessibility(&event);
    };
    for (const QAccessible::Event type : newsOf(before, now)) {
        if (type == QAccessible::StateChanged) {
            QAccessible::State checked;
            checked.checked = true;
            tell(QAccessibleStateChangeEvent(this, checked));
        } else {
            tell(QAccessibleEvent(this, type));
        }
    }
}

QRectF RowsView::onViewport(const QRectF& place) const {
    return place.translated(0, -verticalScrollBar()->value());
}

QPointF RowsView::onPane(QPointF onViewport) const {
    return onViewport + QPointF(0, verticalScrollBar()->value());
}

std::optional<NSInteger> RowsView::currentRow() const {
    const NSInteger count = layout_.rowCount();
    return count > 0 ? std::optional(std::min(currentRow_, count - 1)) : std::nullopt;
}

void RowsView::setCurrentRow(NSInteger row) {
    currentRow_ = row;
    const QRectF place = layout_.rowRect(row);
    QScrollBar& bar = *verticalScrollBar();
    const int margin = static_cast<int>(screen_.rowHeight());
    const int lowest = static_cast<int>(std::ceil(place.bottom())) + margin - viewport()->height();
    const int highest = static_cast<int>(place.top()) - margin;
    bar.setValue(std::min(std::max(bar.value(), lowest), std::max(highest, 0)));
    viewport()->update();
    QAccessibleEvent focused(this, QAccessible::Focus);
    focused.setChild(layout_.lineOfRow(row));
    QAccessible::updateAccessibility(&focused);
}

void RowsView::tap(NSInteger row) {
    if (!content_->isCurrent()) {
        releasePress();
        return;
    }
    highlight_.stop();
    highlightedRow_ = row;
    currentRow_ = row;
    viewport()->update();
    content_->tap(row);
    if (highlightedRow_ && highlight_.state() != QAbstractAnimation::Running) {
        fadeHighlight(); // lists do not tell when to
    }
    screen_.scheduleDrawing();
}

void RowsView::fadeHighlight() { startFading(highlight_, highlightDuration); }

void RowsView::endHighlight() {
    highlight_.stop();
    highlightedRow_.reset();
    viewport()->update();
}

/// Ends at once where the user wants no animations.
void RowsView::startFading(QVariantAnimation& animation, int milliseconds) {
    const bool isWanted =
        style()->styleHint(QStyle::SH_Widget_Animation_Duration, nullptr, this) > 0;
    animation.stop();
    animation.setDuration(isWanted ? milliseconds : 0);
    animation.start();
}

void RowsView::fadeRows(const UITableView& table, const std::vector<NSIndexPath>& paths) {
    if (!isVisible()) {
        return;
    }
    for (const NSIndexPath& path : paths) {
        const auto row = content_->row(table, path);
        const QRectF place = row ? onViewport(layout_.rowRect(*row)) : QRectF();
        if (row && viewport()->rect().intersects(place.toAlignedRect())) {
            fadingRows_[*row] = viewport()->grab(place.toAlignedRect());
        }
    }
    startFading(fade_, fadeDuration);
}

void RowsView::resizeEvent(QResizeEvent* event) {
    QAbstractScrollArea::resizeEvent(event);
    draw();
}

void RowsView::changeEvent(QEvent* event) {
    QAbstractScrollArea::changeEvent(event);
    if (event->type() == QEvent::PaletteChange) {
        colors_ = PaneColors::of(palette(), colors_.tint);
        viewport()->update();
    } else if (event->type() == QEvent::FontChange || event->type() == QEvent::StyleChange ||
               event->type() == QEvent::LayoutDirectionChange) {
        screen_.scheduleDrawing();
    }
}

void RowsView::scrollContentsBy(int /*horizontally*/, int /*vertically*/) {
    press_.reset();
    fadingRows_.clear();
    if (content_->isCurrent()) { // else the layout is not that of the rows: `draw` takes both anew
        drawRows();
    }
    viewport()->update();
}

void RowsView::mousePressEvent(QMouseEvent* event) {
    const auto row = layout_.rowAt(onPane(event->position()));
    if (event->button() == Qt::LeftButton && row && content_->isCurrent()) {
        press_ = Press{*row, event->position()};
        showsCurrentRow_ = false;
        highlight_.stop();
        highlightedRow_ = *row;
        viewport()->update();
    }
}

void RowsView::mouseMoveEvent(QMouseEvent* event) {
    const bool isDrag = press_ && (event->position() - press_->position).manhattanLength() >
                                      QApplication::startDragDistance();
    if (isDrag && layout_.rowAt(onPane(event->position())) != press_->row) {
        releasePress();
    }
}

void RowsView::mouseReleaseEvent(QMouseEvent* event) {
    if (event->button() != Qt::LeftButton) {
        return;
    }
    if (press_ && layout_.rowAt(onPane(event->position())) == press_->row) {
        const NSInteger row = press_->row;
        press_.reset();
        tap(row);
    } else {
        releasePress();
    }
}

void RowsView::releasePress() {
    press_.reset();
    if (highlightedRow_) {
        fadeHighlight();
    }
}

std::optional<NSInteger> RowsView::rowByKey(int key) const {
    const NSInteger last = layout_.rowCount() - 1;
    const NSInteger row = currentRow().value_or(0);
    const auto page = std::max<NSInteger>(
        static_cast<NSInteger>(viewport()->height() / layout_.rowHeight()) - 1, 1);
    const auto within = [last](NSInteger wanted) {
        return std::clamp<NSInteger>(wanted, 0, std::max<NSInteger>(last, 0));
    };
    switch (key) {
    case Qt::Key_Up:
        return within(showsCurrentRow_ ? row - 1 : row);
    case Qt::Key_Down:
        return within(showsCurrentRow_ ? row + 1 : row);
    case Qt::Key_PageUp:
        return within(row - page);
    case Qt::Key_PageDown:
        return within(row + page);
    case Qt::Key_Home:
        return within(0);
    case Qt::Key_End:
        return within(last);
    default:
        return std::nullopt;
    }
}

void RowsView::keyPressEvent(QKeyEvent* event) {
    const auto row = currentRow();
    if (!row) {
        QAbstractScrollArea::keyPressEvent(event);
        return;
    }
    if (const auto next = rowByKey(event->key())) {
        showsCurrentRow_ = true;
        setCurrentRow(*next);
        return;
    }
    switch (event->key()) {
    case Qt::Key_Return:
    case Qt::Key_Enter:
    case Qt::Key_Space:
    case Qt::Key_Select:
        showsCurrentRow_ = true;
        setCurrentRow(*row);
        tap(*row);
        return;
    default:
        QAbstractScrollArea::keyPressEvent(event);
    }
}

void RowsView::focusInEvent(QFocusEvent* event) {
    QAbstractScrollArea::focusInEvent(event);
    showsCurrentRow_ = event->reason() == Qt::TabFocusReason ||
                       event->reason() == Qt::BacktabFocusReason || showsCurrentRow_;
    viewport()->update();
}

void RowsView::focusOutEvent(QFocusEvent* event) {
    QAbstractScrollArea::focusOutEvent(event);
    viewport()->update();
}

void RowsView::paintEvent(QPaintEvent* event) {
    QPainter painter(viewport());
    painter.fillRect(event->rect(), colors_.page);
    // Whole device pixels, whatever the scale.
    const qreal scale = devicePixelRatioF();
    const qreal offset = std::round(verticalScrollBar()->value() * scale) / scale;
    painter.translate(0, -offset);
    const QRectF exposed = QRectF(event->rect()).translated(0, offset);
    for (std::size_t number = 0; number < layout_.sections().size(); ++number) {
        paintSection(painter, number, exposed);
    }
    paintFade(painter);
}

void RowsView::paintSection(QPainter& painter, std::size_t number, const QRectF& exposed) const {
    const auto& content = content_->sections()[number];
    const auto& section = layout_.sections()[number];
    painter.setFont(smallFont());
    painter.setPen(colors_.secondary);
    if (section.title.intersects(exposed)) {
        paintWrapped(painter, QString::fromStdString(content.title.value_or("")), section.title,
                     layoutDirection());
    }
    if (section.footer.intersects(exposed)) {
        paintWrapped(painter, QString::fromStdString(content.footer.value_or("")), section.footer,
                     layoutDirection());
    }
    if (section.card.intersects(exposed)) {
        paintCard(painter, section, exposed);
    }
}

void RowsView::paintCard(QPainter& painter, const RowsLayout::Section& section,
                         const QRectF& exposed) const {
    // Corners that are far off the screen are beyond what a painter can reckon with.
    const QRectF near = exposed.adjusted(0, -4 * cardRadius, 0, 4 * cardRadius);
    QPainterPath card;
    card.addRoundedRect(section.card.intersected(near.adjusted(-widestCard, 0, widestCard, 0)),
                        cardRadius, cardRadius);
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing);
    painter.fillPath(card, colors_.card);
    if (highlightedRow_) {
        const bool isFading = highlight_.state() == QAbstractAnimation::Running;
        painter.setClipPath(card);
        painter.setOpacity(isFading ? highlight_.currentValue().toDouble() : 1.0);
        painter.fillRect(layout_.rowRect(*highlightedRow_), colors_.highlight);
    }
    painter.restore();
    const NSInteger end = section.firstRow + section.rowCount;
    NSInteger row = std::max(layout_.firstRowBelow(exposed.top()), section.firstRow);
    for (; row < end && layout_.rowRect(row).top() < exposed.bottom(); ++row) {
        paintRow(painter, row, row + 1 == end);
    }
}

void RowsView::paintRow(QPainter& painter, NSInteger row, bool isLast) const {
    const QRectF place = layout_.rowRect(row);
    if (const auto cell = content_->cell(row)) {
        paintCell(painter, *cell, place, screen_.font(), colors_, layoutDirection());
    }
    if (!isLast) {
        const qreal thickness = 1 / devicePixelRatioF();
        const bool isMirrored = layoutDirection() == Qt::RightToLeft;
        const qreal left = place.left() + (isMirrored ? 0 : separatorIndent);
        painter.fillRect(
            QRectF(left, place.bottom() - thickness, place.width() - separatorIndent, thickness),
            colors_.separator);
    }
    if (showsCurrentRow_ && hasFocus() && currentRow() == row) {
        painter.save();
        painter.setRenderHint(QPainter::Antialiasing);
        painter.setPen(QPen(colors_.tint, 2));
        painter.drawRoundedRect(place.adjusted(2, 2, -2, -2), cardRadius - 2, cardRadius - 2);
        painter.restore();
    }
}

void RowsView::paintFade(QPainter& painter) const {
    painter.setOpacity(fade_.currentValue().toDouble());
    for (const auto& [row, picture] : fadingRows_) {
        const QRectF place = layout_.rowRect(row);
        if (!place.isEmpty()) {
            painter.drawPixmap(place.topLeft(), picture);
        }
    }
    painter.setOpacity(1);
}

} // namespace quorl
