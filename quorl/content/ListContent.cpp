#include "quorl/content/ListContent.h"

#include <algorithm>
#include <charconv>
#include <limits>

#include "platform/HostApp.h"
#include "quorl/content/ButtonCell.h"
#include "quorl/content/ChoiceRow.h"
#include "quorl/content/ProgressCell.h"
#include "quorl/content/SwitchCell.h"
#include "runtime/lists/ListView.h"

namespace quorl {

namespace {

/// A cell with what rows of all kinds have; it is still to be laid out.
template <class Cell>
std::shared_ptr<Cell> begin(const ListView::Row& row, UITableViewCellStyle style) {
    auto cell =
        ::create<Cell>(&UITableViewCell::initWithStyle_reuseIdentifier, style, std::string());
    cell->textLabel().setText(row.specifier->name());
    cell->textLabel().setTextColor(PSListController::appearance().textColor);
    return cell;
}

std::shared_ptr<UITableViewCell> switchOf(const ListView::Row& row) {
    auto cell = begin<SwitchCell>(row, UITableViewCellStyle::Value1);
    cell->setOn(row.value == PSSwitchOnValue);
    cell->layoutSubviews();
    return cell;
}

std::shared_ptr<UITableViewCell> buttonOf(const ListView::Row& row) {
    auto cell = begin<ButtonCell>(row, UITableViewCellStyle::Value1);
    cell->textLabel().setTextColor(QPSQuorlTintColor());
    cell->layoutSubviews();
    return cell;
}

/// Written and read the same in every language.
double shareIn(std::string_view text) {
    double share = 0;
    std::from_chars(text.data(), text.data() + text.size(), share);
    return std::clamp(share, 0.0, 1.0);
}

std::shared_ptr<UITableViewCell> progressOf(const ListView::Row& row, const std::string& progress) {
    auto cell = begin<ProgressCell>(row, UITableViewCellStyle::Value1);
    cell->detailTextLabel().setText(row.value);
    cell->setProgress(shareIn(progress));
    cell->layoutSubviews();
    return cell;
}

std::shared_ptr<UITableViewCell> makeCell(const ListView::Row& row, UITableViewCellStyle style) {
    auto cell = begin<UITableViewCell>(row, style);
    cell->detailTextLabel().setText(row.value);
    if (row.specifier->detailControllerClass()) {
        cell->setAccessoryType(UITableViewCellAccessoryType::DisclosureIndicator);
    } else if (row.specifier->propertyForKey(RowChosenKey) == "yes") {
        cell->setAccessoryType(UITableViewCellAccessoryType::Checkmark);
    }
    cell->layoutSubviews();
    return cell;
}

bool isShortened(const UILabel& label) {
    constexpr CGFloat unbounded = std::numeric_limits<CGFloat>::max();
    constexpr CGFloat roundingError = CGFloat(0.01);
    return label.sizeThatFits({unbounded, unbounded}).width > label.frame().width + roundingError;
}

/// The value is beside the title where there is room for both, else below it.
std::shared_ptr<UITableViewCell> cellOf(const ListView::Row& row) {
    if (row.specifier->cellType() == PSCellType::Switch) {
        return switchOf(row);
    }
    const bool isChoice = row.specifier->propertyForKey(RowChosenKey).has_value();
    if (row.specifier->cellType() == PSCellType::Button && !isChoice) {
        return buttonOf(row);
    }
    if (const auto progress = row.specifier->propertyForKey(RowProgressKey)) {
        return progressOf(row, *progress);
    }
    auto cell = makeCell(row, UITableViewCellStyle::Value1);
    return isShortened(cell->detailTextLabel()) ? makeCell(row, UITableViewCellStyle::Subtitle)
                                                : cell;
}

} // namespace

void ListContent::draw(NSInteger /*firstRow*/, NSInteger /*rowsOnScreen*/) {
    sections_.clear();
    rows_.clear();
    const auto* list = dynamic_cast<PSListController*>(pane_.get());
    if (!list) {
        return;
    }
    quorl::draw(*pane_);
    for (const auto& row : ListView::of(*list).rows()) {
        if (row.specifier->cellType() == PSCellType::Group) {
            sections_.push_back({row.specifier->name(), row.footer, 0});
            continue;
        }
        if (sections_.empty()) {
            sections_.emplace_back(); // rows before the first group
        }
        ++sections_.back().rowCount;
        rows_.push_back({row.specifier, cellOf(row)});
    }
    leaveOutHidden();
}

void ListContent::leaveOutHidden() {
    if (!shownRows_) {
        return;
    }
    std::erase_if(*shownRows_, [this](NSInteger row) { return !rowAt(row); });
    auto shown = shownRows_->begin();
    NSInteger end = 0;
    for (Section& section : sections_) {
        end += section.rowCount;
        const auto after = std::lower_bound(shown, shownRows_->end(), end);
        section =
            after == shown ? Section() : Section{section.title, section.footer, after - shown};
        shown = after;
    }
}

void ListContent::showOnly(std::optional<std::vector<NSInteger>> paneRows) {
    shownRows_ = std::move(paneRows);
}

NSInteger ListContent::paneRowCount() const { return static_cast<NSInteger>(rows_.size()); }

std::shared_ptr<UITableViewCell> ListContent::cellOfPaneRow(NSInteger paneRow) {
    const Row* found = rowAt(paneRow);
    return found ? found->cell : nullptr;
}

/// A list that is drawn anew for its texts keeps its rows.
bool ListContent::isCurrent() const {
    auto* list = dynamic_cast<PSListController*>(pane_.get());
    if (!list) {
        return true;
    }
    const auto& drawn = ListView::of(*list).rows();
    const auto now = elements<PSSpecifier>(list->specifiers());
    return std::equal(drawn.begin(), drawn.end(), now.begin(), now.end(),
                      [](const ListView::Row& row, const std::shared_ptr<PSSpecifier>& specifier) {
                          return row.specifier == specifier;
                      });
}

const ListContent::Row* ListContent::rowAt(NSInteger paneRow) const {
    return paneRow >= 0 && paneRow < static_cast<NSInteger>(rows_.size())
               ? &rows_[static_cast<std::size_t>(paneRow)]
               : nullptr;
}

std::shared_ptr<UITableViewCell> ListContent::cell(NSInteger row) const {
    const bool isShown = row >= 0 && row < rowCount();
    const Row* found = isShown ? rowAt(paneRow(row)) : nullptr;
    return found ? found->cell : nullptr;
}

bool ListContent::tap(NSInteger row) {
    const Row* found = rowAt(paneRow(row));
    if (!found || !isCurrent()) {
        return false;
    }
    const std::shared_ptr specifier = found->specifier;
    if (const auto* toggle = dynamic_cast<const SwitchCell*>(found->cell.get())) {
        specifier->setValue(NSNumber::numberWithBool(!toggle->isOn()));
    } else if (specifier->cellType() == PSCellType::Button) {
        specifier->setValue(nullptr);
    } else {
        open(specifier);
    }
    return true;
}

/// Rows may be made anew while what they have opened stays.
bool ListContent::isOpen(const PSSpecifier& row) const {
    const auto above = navigation_.above(*pane_);
    const auto* const opened = dynamic_cast<const PSController*>(above.get());
    const auto by = opened ? opened->specifier() : nullptr;
    return by && by->name() == row.name() &&
           by->detailControllerClass() == row.detailControllerClass();
}

/// The panes above this one give way, where they are not what the row has opened itself.
void ListContent::open(const std::shared_ptr<PSSpecifier>& row) {
    if (isOpen(*row)) {
        navigation_.returnTo(*navigation_.above(*pane_));
    } else if (row->detailControllerClass()) {
        navigation_.returnTo(*pane_);
        navigation_.open(row);
    }
}

std::optional<NSInteger> ListContent::openRow() const {
    const auto found =
        std::ranges::find_if(rows_, [this](const Row& row) { return isOpen(*row.specifier); });
    return found != rows_.end() ? rowOfPaneRow(found - rows_.begin()) : std::nullopt;
}

std::optional<NSInteger> ListContent::row(const UITableView& /*table*/,
                                          const NSIndexPath& /*path*/) const {
    return std::nullopt;
}

} // namespace quorl
