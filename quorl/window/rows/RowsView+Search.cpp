#include <QKeyEvent>
#include <QScrollBar>

#include "quorl/window/rows/RowsView.h"

namespace quorl {

namespace {

constexpr int searchHeight = 52;

} // namespace

void RowsView::connectSearch() {
    connect(&finder_, &RowFinder::checkedFound, this, &RowsView::openAt);
    connect(&finder_, &RowFinder::beginningFound, this, &RowsView::goToPaneRow);
    connect(&finder_, &RowFinder::matchesChanged, this,
            [this](const std::vector<NSInteger>& rows) { showMatches(rows); });
}

/// Few ever search, and a field for text loads much.
void RowsView::makeSearchField() {
    search_ = new SearchField(screen_, this);
    connect(search_, &SearchField::textChanged, this, [this](const QString& text) {
        currentRow_ = 0;
        verticalScrollBar()->setValue(0);
        if (text.isEmpty()) {
            finder_.endFilter();
            showMatches(std::nullopt);
        } else {
            finder_.filter(text);
        }
    });
    connect(search_, &SearchField::left, this, [this] {
        setFocus(Qt::ShortcutFocusReason);
        if (currentRow()) {
            setCurrentRow(*currentRow());
        }
    });
    connect(search_, &SearchField::closed, this, &RowsView::closeSearch);
}

bool RowsView::canBeSearched() const {
    return isSearched() || layout_.height() > viewport()->height();
}

void RowsView::openSearch() {
    if (!canBeSearched()) {
        return;
    }
    if (search_ == nullptr) {
        makeSearchField();
    }
    search_->open();
    placeSearch();
}

/// Above the rows while it is open.
void RowsView::placeSearch() {
    const int height = isSearched() ? searchHeight : 0;
    if (viewportMargins().top() != height) {
        setViewportMargins(0, height, 0, 0);
    }
    if (search_ != nullptr) {
        search_->setGeometry(0, 0, width(), searchHeight);
    }
    scrollBar_->setPage(rect().adjusted(0, height, 0, 0));
}

void RowsView::showMatches(std::optional<std::vector<NSInteger>> paneRows) {
    if (search_ != nullptr) {
        search_->setFound(!paneRows || !paneRows->empty());
    }
    content_->showOnly(std::move(paneRows));
    draw(); // at once: no row may be tapped that is not drawn
}

void RowsView::closeSearch() {
    if (!isSearched()) {
        return;
    }
    const auto found = currentRow();
    const NSInteger paneRow = found ? content_->paneRow(*found) : 0;
    finder_.endFilter();
    search_->hide();
    placeSearch();
    showMatches(std::nullopt);
    setFocus(Qt::ShortcutFocusReason);
    goToPaneRow(paneRow);
}

void RowsView::goToPaneRow(NSInteger paneRow) {
    const auto row = content_->rowOfPaneRow(paneRow);
    if (row && *row < layout_.rowCount()) {
        setCurrentRow(*row);
    }
}

/// In the middle, so that its neighbours are seen.
void RowsView::openAt(NSInteger paneRow) {
    goToPaneRow(paneRow);
    const QRectF place = layout_.rowRect(currentRow_);
    if (verticalScrollBar()->value() > 0) {
        verticalScrollBar()->setValue(qRound(place.center().y()) - viewport()->height() / 2);
    }
}

void RowsView::typeAhead(const QKeyEvent& event) {
    typeAhead_.type(event.text(), event.timestamp());
    const NSInteger from = content_->paneRow(currentRow().value_or(0));
    finder_.findBeginning(typeAhead_.beginning(), typeAhead_.isNew() ? from + 1 : from);
}

} // namespace quorl
