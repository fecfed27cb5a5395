#include "quorl/content/PaneContent.h"

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

} // namespace quorl
