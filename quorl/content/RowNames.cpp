#include "quorl/content/RowNames.h"

namespace quorl {

bool RowNames::areComplete() const {
    return static_cast<NSInteger>(names_.size()) >= content_.paneRowCount();
}

void RowNames::readMore(NSInteger count) {
    while (count-- > 0 && content_.isCurrent() && !areComplete()) {
        const auto row = static_cast<NSInteger>(names_.size());
        const auto cell = content_.cellOfPaneRow(row);
        if (!checkedRow_ && cell &&
            cell->accessoryType() == UITableViewCellAccessoryType::Checkmark) {
            checkedRow_ = row;
        }
        names_.push_back(cell ? cell->textLabel().text().value_or("") : "");
    }
}

void RowNames::forget() {
    names_.clear();
    checkedRow_.reset();
}

} // namespace quorl
