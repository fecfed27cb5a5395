#pragma once

#include <cstdint>
#include <memory>
#include <stop_token>
#include <string>
#include <vector>

#include "services/media/Collation.h"
#include "services/media/FolderTree.h"
#include "services/media/Inventory.h"

namespace quorl::media {

/// Builds inventories of what a tree has read, one after the other. What the entries of playlists
/// mean is kept in the tree and found out again only where that may have changed. For one thread at
/// a time.
class InventoryBuilder {
  public:
    /// `tree` outlives the builder, and tells its news to nobody else.
    explicit InventoryBuilder(FolderTree& tree) : tree_(tree) {}

    /// The inventory of what the tree knows now; the same as if nothing had been known before. Asks
    /// the file system for what it has to know of songs, and notes that in the tree. Null: stopped
    /// before the end.
    [[nodiscard]] std::shared_ptr<const Inventory> build(const std::stop_token& stop);

  private:
    /// A playlist or a folder that belongs into the inventory.
    struct Listed {
        /// Where the file lies; for a folder, the folder itself.
        Directory* directory;
        /// Null for a folder.
        PlaylistFile* file;
        const Title* title;
    };

    void collect();
    void collectPlaylists(Directory& directory);
    void leaveOutDoubles();
    void findMeanings(const std::stop_token& stop);
    [[nodiscard]] bool mayMeanOtherwise(const Meaning& meaning) const;
    void examineSongs(const std::stop_token& stop);
    [[nodiscard]] std::shared_ptr<const Inventory> takeInventory() const;

    FolderTree& tree_;
    const Collation collation_;
    /// In their order in the inventory.
    std::vector<Listed> listed_;
    /// Directories and playlists of which there is nothing.
    std::vector<LeftOut> leftOut_;
    bool hasAudio_ = false;
    bool hasMusicVideo_ = false;
    bool isFirst_ = true;
};

} // namespace quorl::media
