#include "runtime/lists/ListView.h"

#include <algorithm>

namespace quorl {

void ListView::draw() {
    if (!shown_ || !marked_) {
        return;
    }
    marked_ = false;
    std::vector<Row> rows;
    for (const auto& specifier : elements<PSSpecifier>(controller_.specifiers())) {
        rows.push_back(
            {specifier, specifier->value(), specifier->propertyForKey(PSFooterTextGroupKey)});
    }
    rows_ = std::move(rows);
}

void ListView::update(const std::shared_ptr<PSSpecifier>& specifier) {
    auto value = specifier->value();
    const auto row = std::find_if(rows_.begin(), rows_.end(), [&specifier](const Row& candidate) {
        return candidate.specifier == specifier;
    });
    if (row != rows_.end()) {
        row->value = std::move(value);
    }
}

} // namespace quorl
