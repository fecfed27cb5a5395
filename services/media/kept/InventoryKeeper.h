#pragma once

#include <filesystem>
#include <memory>

#include "services/media/Inventory.h"

namespace quorl::media {

/// Keeps what a music folder held in a file, for the next start. That costs what the folder is
/// large, not what has changed in it, so it is done when the folder was read for the first time,
/// and at the end.
///
/// Where the file cannot be written, the next start has nothing to show before it has read the
/// folder, and nothing else is amiss. One thread at a time.
class InventoryKeeper {
  public:
    /// Reads what is kept in `file` of the music folder at `root`.
    InventoryKeeper(std::filesystem::path file, const std::filesystem::path& root);

    /// What was kept when the keeper was made; null for nothing, and after the first `take`, when
    /// it is only held by whoever shows it.
    [[nodiscard]] const std::shared_ptr<const Inventory>& kept() const { return kept_; }

    /// Takes note of what the folder holds now, which is not what it held before, and keeps it
    /// where it is the first.
    void take(std::shared_ptr<const Inventory> inventory);

    /// Keeps what was last taken, where that is not in the file.
    void keepLast();

  private:
    const std::filesystem::path file_;
    std::shared_ptr<const Inventory> kept_;
    std::shared_ptr<const Inventory> last_;
    bool isLastInFile_ = false;
};

} // namespace quorl::media
