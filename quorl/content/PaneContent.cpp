#include "quorl/content/PaneContent.h"

#include <algorithm>
#include <numeric>

#include "quorl/content/ListContent.h"
#include "quorl/content/TableContent.h"

namespace quorl {

std::unique_ptr<PaneContent> PaneContent::of(const std::shared_ptr<UIViewController>& pane,
                                             NavigationController& navigation) {
    if (auto table = std::dynamic_pointer_cast<UITableViewController>(pane)) {
        return std::make_unique<TableContent>(std::move(table));
    }
    return std::make_unique<ListContent>(pane, navigation);
}

NSInteger PaneContent::rowCount() const {
    return std::accumulate(
        sections().begin(), sections().end(), NSInteger{0},
        [](NSInteger sum, const Section& section) { return sum + section.rowCount; });
}

std::shared_ptr<UITableViewCell> PaneContent::cellAnywhere(NSInteger row) {
    if (auto onScreen = cell(row)) {
        return onScreen;
    }
    return row >= 0 && row < rowCount() ? cellOfPaneRow(paneRow(row)) : nullptr;
}

NSInteger PaneContent::paneRow(NSInteger row) const {
    const auto& shown = shownRows();
    const bool isMapped = shown && row >= 0 && row < static_cast<NSInteger>(shown->size());
    return isMapped ? (*shown)[static_cast<std::size_t>(row)] : row;
}

std::optional<NSInteger> PaneContent::rowOfPaneRow(NSInteger paneRow) const {
    const auto& shown = shownRows();
    if (!shown) {
        return paneRow;
    }
    const auto found = std::lower_bound(shown->begin(), shown->end(), paneRow);
    return found != shown->end() && *found == paneRow ? std::optional(found - shown->begin())
                                                      : std::nullopt;
}

} // namespace quorl
