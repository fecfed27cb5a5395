#include "services/media/kept/InventoryKeeper.h"

#include <system_error>
#include <utility>

#include "services/media/kept/KeptInventory.h"

namespace quorl::media {

InventoryKeeper::InventoryKeeper(std::filesystem::path file, const std::filesystem::path& root)
    : file_(std::move(file)), kept_(keptInventory(file_, root)) {}

void InventoryKeeper::take(std::shared_ptr<const Inventory> inventory) {
    const bool isFirst = !last_;
    last_ = std::move(inventory);
    isLastInFile_ = isFirst && kept_ && *kept_ == *last_;
    kept_.reset();
    if (isFirst) {
        keepLast();
    }
}

void InventoryKeeper::keepLast() {
    if (!last_ || isLastInFile_) {
        return;
    }
    try {
        keepInventory(file_, *last_);
        isLastInFile_ = true;
    } catch (const std::system_error&) {
        // The next start has nothing to show at first.
    }
}

} // namespace quorl::media
