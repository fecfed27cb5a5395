#include "quorl/window/rows/RowsView.h"

#include <QPainter>
#include <QScrollBar>
#include <cmath>

#include "quorl/window/accessible/RowsAccessible.h"
#include "quorl/window/cells/WrappedText.h"
#include "quorl/window/rows/RowsPainter.h"

namespace quorl {

namespace {

constexpr qreal pageMargin = 16;
constexpr qreal widestCard = 640;

} // namespace

RowsView::RowsView(std::unique_ptr<PaneContent> content, WindowScreen& screen, QWidget* parent)
    : QAbstractScrollArea(parent),
      content_(std::move(content)),
      screen_(screen),
      colors_(PaneColors::of(palette(), screen.look())),
      places_(*content_),
      touch_(screen),
      momentum_(*viewport()),
      finder_(*content_),
      scrollBar_(new OverlayScrollBar(*verticalScrollBar(), screen, this)) {
    RowsAccessible::install();
    setFrameShape(QFrame::NoFrame);
    setFocusPolicy(Qt::StrongFocus);
    setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    setVerticalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    viewport()->setMouseTracking(true);
    longPress_.setSingleShot(true);
    connect(&longPress_, &QTimer::timeout, this, [this] {
        if (const auto row = touch_.pressedRow(); row && content_->isCurrent()) {
            touch_.cancel();
            askContext(*row);
        }
    });
    connect(&touch_, &RowTouch::changed, this, &RowsView::updateRow);
    connect(&momentum_, &Momentum::dragged, &touch_, &RowTouch::cancel);
    connect(&fades_, &RowFades::changed, this, &RowsView::updateRow);
    connectScreen();
    connectSearch();
}

RowsView::~RowsView() = default;

void RowsView::connectScreen() {
    connect(&screen_, &PaneScreen::rowsWillFade, this, &RowsView::fadeRows);
    connect(&screen_, &PaneScreen::rowWillBeDeselected, this,
            [this](const UITableView& table, const NSIndexPath& path, bool animated) {
                if (content_->row(table, path) == touch_.litRow()) {
                    animated ? touch_.fade() : touch_.endLight();
                }
            });
    connect(&screen_, &WindowScreen::lookChanged, this, [this] {
        colors_ = PaneColors::of(palette(), screen_.look());
        viewport()->update();
    });
    connect(&screen_.lastInput(), &LastInput::changed, this, &RowsView::updateCurrentRow);
}

void RowsView::draw() {
    const bool isReloaded = !content_->isCurrent();
    if (isReloaded) {
        touch_.cancel(); // a finger came down on another row
    }
    const RowsLayout before = layout_;
    const int scrolled = verticalScrollBar()->value();
    layOut(); // the screen's geometry is that of this view before cells are laid out
    drawRows();
    layOut();
    if (isReloaded) {
        keepPlaces(before, scrolled);
        finder_.rowsDidChange();
    }
    if (isHidden()) { // whoever comes back is on the row that has led on
        currentRow_ = content_->openRow().value_or(currentRow_);
    }
    notePlaces();
    showChanges(before);
    if (isVisible() && !std::exchange(isOpened_, true)) {
        finder_.findChecked();
    }
}

void RowsView::drawRows() {
    // Another view may be beside this, and have been drawn since.
    screen_.setGeometry(layout_.width(), devicePixelRatioF());
    // Also right for a pane that has more rows now than when it was laid out.
    const auto onScreen =
        static_cast<NSInteger>(std::ceil(viewport()->height() / screen_.rowHeight())) + 1;
    content_->draw(layout_.firstRowBelow(verticalScrollBar()->value()), onScreen);
}

void RowsView::layOut() {
    const qreal scale = devicePixelRatioF();
    const qreal available = viewport()->width();
    const qreal width = std::clamp<qreal>(available - 2 * pageMargin, 1, widestCard);
    const qreal left = std::round((available - width) / 2 * scale) / scale;
    const qreal rowWidth = std::floor(width * scale) / scale;
    screen_.setGeometry(rowWidth, scale);
    const auto heightOf = [this](RowsLayout::LineKind kind, const std::string& text, qreal room) {
        const QFont font =
            kind == RowsLayout::LineKind::Title ? screen_.headingFont() : screen_.smallFont();
        return heightOfLines(wrappedLines(QString::fromStdString(text), font, room), font);
    };
    layout_ = RowsLayout(content_->sections(), left, rowWidth, screen_.rowHeight(), heightOf);
    const int beyond = static_cast<int>(layout_.height()) - viewport()->height();
    verticalScrollBar()->setRange(0, std::max(beyond, 0));
    verticalScrollBar()->setPageStep(viewport()->height());
    verticalScrollBar()->setSingleStep(static_cast<int>(screen_.rowHeight() / 2));
}

/// Who is at the top of a pane stays there, and sees what arrives.
void RowsView::keepPlaces(const RowsLayout& before, int scrolled) {
    const auto move = places_.moveOnScreen();
    if (const auto row = places_.placeOfCurrent()) {
        currentRow_ = *row;
    } else {
        currentRow_ = std::max<NSInteger>(currentRow_ + (move ? move->to - move->from : 0), 0);
        places_.forgetCurrent();
    }
    if (move && scrolled > 0) {
        const qreal shift = layout_.rowRect(move->to).top() - before.rowRect(move->from).top();
        verticalScrollBar()->setValue(scrolled + qRound(shift));
    }
}

void RowsView::showChanges(const RowsLayout& before) {
    auto now = linesOnScreen();
    if (layout_ != before) {
        viewport()->update();
    }
    for (const auto& [line, shown] : now) {
        const auto known = shown_.find(line);
        if (known == shown_.end()) {
            updatePlace(shown.place);
        } else if (known->second != shown) {
            updatePlace(shown.place);
            for (const auto news : newsOf(known->second.texts, shown.texts)) {
                tell(line, news);
            }
            if (shown.isMarked && !known->second.isMarked) {
                tell(line, QAccessible::Selection);
            }
        }
    }
    shown_ = std::move(now);
}

std::map<int, RowsView::ShownLine> RowsView::linesOnScreen() const {
    std::map<int, ShownLine> lines;
    const int top = verticalScrollBar()->value();
    const auto marked = markedRow();
    for (const int index : layout_.linesBetween(top, top + viewport()->height())) {
        const auto line = layout_.line(index);
        const bool isMarked = marked && index == layout_.lineOfRow(*marked);
        lines.emplace(index, ShownLine{line.rect, textsOfLine(line), isMarked});
    }
    return lines;
}

RowTexts RowsView::textsOfLine(const RowsLayout::Line& line) const {
    if (line.kind == RowsLayout::LineKind::Row) {
        const auto cell = content_->cell(line.row);
        return cell ? textsOf(*cell) : RowTexts();
    }
    const auto& section = content_->sections()[line.section];
    const auto& text = line.kind == RowsLayout::LineKind::Title ? section.title : section.footer;
    return {QString::fromStdString(text.value_or("")), {}, false};
}

void RowsView::tell(int line, QAccessible::Event news) {
    const auto send = [line](QAccessibleEvent&& event) {
        event.setChild(line);
        QAccessible::updateAccessibility(&event);
    };
    if (news == QAccessible::StateChanged) {
        QAccessible::State checked;
        checked.checked = true;
        send(QAccessibleStateChangeEvent(this, checked));
    } else {
        send(QAccessibleEvent(this, news));
    }
    Q_EMIT told(line, news);
}

void RowsView::tellFocus() {
    const auto row = currentRow();
    if (row && hasFocus()) {
        tell(layout_.lineOfRow(*row), QAccessible::Focus);
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

void RowsView::makeCurrent(NSInteger row) {
    updateCurrentRow();
    currentRow_ = row;
    updateCurrentRow();
    notePlaces();
}

void RowsView::notePlaces() {
    places_.note(layout_.firstRowBelow(verticalScrollBar()->value()), currentRow_);
}

void RowsView::setOpenRow(OpenRow openRow) {
    if (std::exchange(openRow_, openRow) != openRow) {
        viewport()->update();
    }
}

std::optional<NSInteger> RowsView::markedRow() const {
    return openRow_ == OpenRow::Marked ? content_->openRow() : std::nullopt;
}

void RowsView::setCurrentRow(NSInteger row) {
    finder_.stopFindingChecked();
    momentum_.stop();
    makeCurrent(row);
    const QRectF place = layout_.rowRect(row);
    QScrollBar& bar = *verticalScrollBar();
    const int margin = static_cast<int>(screen_.rowHeight());
    const int lowest = static_cast<int>(std::ceil(place.bottom())) + margin - viewport()->height();
    const int highest = static_cast<int>(place.top()) - margin;
    bar.setValue(std::min(std::max(bar.value(), lowest), std::max(highest, 0)));
    tell(layout_.lineOfRow(row), QAccessible::Focus);
}

void RowsView::tap(NSInteger row) {
    if (!content_->isCurrent()) {
        touch_.cancel();
        return;
    }
    makeCurrent(row);
    touch_.light(row);
    content_->tap(row);
    if (touch_.litRow() && !touch_.isFading()) {
        touch_.fade(); // lists do not tell when to
    }
    screen_.scheduleDrawing();
}

void RowsView::fadeRows(const UITableView& table, const std::vector<NSIndexPath>& paths) {
    if (!isVisible() || screen_.look().motion == Motion::Reduced) {
        return;
    }
    for (const NSIndexPath& path : paths) {
        const auto row = content_->row(table, path);
        const QRectF place = row ? onViewport(layout_.rowRect(*row)) : QRectF();
        if (row && viewport()->rect().intersects(place.toAlignedRect())) {
            fades_.keep(*row, viewport()->grab(place.toAlignedRect()));
        }
    }
    fades_.begin(screen_.look().motion);
}

void RowsView::updatePlace(const QRectF& place) {
    viewport()->update(onViewport(place).toAlignedRect().adjusted(-1, -1, 1, 1));
}

void RowsView::updateRow(NSInteger row) { updatePlace(layout_.rowRect(row)); }

void RowsView::updateCurrentRow() {
    if (const auto row = currentRow()) {
        updateRow(*row);
    }
}

bool RowsView::showsFocus() const {
    return hasFocus() && screen_.lastInput().kind() == LastInput::Kind::Keys;
}

TouchState RowsView::stateOf(NSInteger row) const {
    TouchState state = touch_.stateOf(row);
    state.isRinged = showsFocus() && currentRow() == row;
    state.isMarked = markedRow() == row;
    return state;
}

void RowsView::paintEvent(QPaintEvent* event) {
    QPainter painter(viewport());
    painter.fillRect(event->rect(), colors_.page);
    // Whole device pixels, whatever the scale.
    const qreal scale = devicePixelRatioF();
    const qreal offset = std::round(verticalScrollBar()->value() * scale) / scale;
    painter.translate(0, -offset);
    painter.setLayoutDirection(layoutDirection());
    const RowsPainter::Subject subject{*content_, layout_, screen_, colors_,
                                       [this](NSInteger row) { return stateOf(row); }};
    RowsPainter(painter, subject).paint(QRectF(event->rect()).translated(0, offset));
    fades_.paint(painter, layout_);
}

void RowsView::resizeEvent(QResizeEvent* event) {
    QAbstractScrollArea::resizeEvent(event);
    placeSearch();
    draw();
}

void RowsView::changeEvent(QEvent* event) {
    QAbstractScrollArea::changeEvent(event);
    if (event->type() == QEvent::PaletteChange) {
        colors_ = PaneColors::of(palette(), screen_.look());
        viewport()->update();
    } else if (event->type() == QEvent::FontChange || event->type() == QEvent::StyleChange ||
               event->type() == QEvent::LayoutDirectionChange) {
        screen_.scheduleDrawing();
    }
}

void RowsView::scrollContentsBy(int /*horizontally*/, int /*vertically*/) {
    touch_.cancel();
    touch_.hover(std::nullopt);
    fades_.end();
    if (content_->isCurrent()) { // else the layout is not that of the rows: `draw` takes both anew
        drawRows();
        notePlaces();
    }
    viewport()->update();
}

} // namespace quorl
