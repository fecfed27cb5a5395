#include "quorl/search/RowFinder.h"

#include "quorl/search/FoldedText.h"

namespace quorl {

namespace {

constexpr NSInteger firstSlice = 1024; // what is found at once, before anything is painted
constexpr NSInteger slice = 256;

} // namespace

RowFinder::RowFinder(PaneContent& content) : names_(content), content_(content) {
    timer_.setSingleShot(true);
    timer_.setInterval(0);
    connect(&timer_, &QTimer::timeout, this, [this] { readSlice(slice); });
}

void RowFinder::findChecked() {
    findsChecked_ = true;
    readSlice(firstSlice);
}

void RowFinder::filter(const QString& text) {
    filter_ = folded(text);
    matches_.clear();
    unmatched_ = 0;
    isMatchedAnew_ = false;
    readSlice(folded_.isEmpty() ? firstSlice : 0);
    Q_EMIT matchesChanged(matches_);
}

void RowFinder::endFilter() { filter_.reset(); }

void RowFinder::findBeginning(const QString& beginning, NSInteger start) {
    beginning_ = Beginning{beginning, start};
    readSlice(folded_.isEmpty() ? firstSlice : 0);
}

void RowFinder::rowsDidChange() {
    names_.forget();
    folded_.clear();
    matches_.clear();
    unmatched_ = 0;
    isMatchedAnew_ = true;
    readSlice(isReading() ? firstSlice : 0);
}

bool RowFinder::isReading() const {
    return (findsChecked_ || filter_ || beginning_) && !names_.areComplete();
}

void RowFinder::readSlice(NSInteger rows) {
    if (isReading()) {
        names_.readMore(rows);
    }
    const auto& names = names_.names();
    for (auto index = static_cast<std::size_t>(folded_.size()); index < names.size(); ++index) {
        folded_ << folded(QString::fromStdString(names[index]));
    }
    advance();
    if (isReading() && content_.isCurrent()) {
        timer_.start();
    }
}

void RowFinder::advance() {
    tellChecked();
    if (filter_) {
        addMatches();
    }
    tellBeginning();
}

void RowFinder::addMatches() {
    const auto before = matches_.size();
    for (; unmatched_ < folded_.size(); ++unmatched_) {
        if (folded_[unmatched_].contains(*filter_)) {
            matches_.push_back(unmatched_);
        }
    }
    const bool isDone = names_.areComplete();
    if (isMatchedAnew_ ? isDone : matches_.size() != before) {
        isMatchedAnew_ = false;
        Q_EMIT matchesChanged(matches_);
    }
}

void RowFinder::tellChecked() {
    if (!findsChecked_ || !(names_.checkedRow() || names_.areComplete())) {
        return;
    }
    findsChecked_ = false;
    if (const auto row = names_.checkedRow()) {
        Q_EMIT checkedFound(*row);
    }
}

void RowFinder::tellBeginning() {
    if (!beginning_ || !names_.areComplete()) {
        return;
    }
    const Beginning sought = *std::exchange(beginning_, std::nullopt);
    for (qsizetype step = 0; step < folded_.size(); ++step) {
        const qsizetype row = (sought.start + step) % folded_.size();
        if (folded_[row].startsWith(sought.text)) {
            Q_EMIT beginningFound(row);
            return;
        }
    }
}

} // namespace quorl
