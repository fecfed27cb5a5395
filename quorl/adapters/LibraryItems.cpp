#include "quorl/adapters/LibraryItems.h"

#include "services/media/PlaylistIdentity.h"

namespace quorl {

namespace {

struct Items;

class LibraryItem final : public MPMediaItem {
  public:
    void attach(Items& items, media::SongIndex song, std::uint64_t fileSize) {
        items_ = &items;
        song_ = song;
        fileSize_.emplace(fileSize);
    }

    [[nodiscard]] std::uint64_t persistentID() const override;
    [[nodiscard]] std::shared_ptr<NSObject>
    valueForProperty(MPMediaProperty property) const override;

  private:
    Items* items_ = nullptr; ///< which this item is part of
    media::SongIndex song_ = 0;
    mutable std::optional<NSNumber> fileSize_; ///< handed out; a number never changes
};

/// Whoever holds one of the items holds all of them.
struct Items : std::enable_shared_from_this<Items> {
    Items(std::shared_ptr<const media::Inventory> from, std::size_t count)
        : inventory(std::move(from)), items(count) {}

    std::shared_ptr<const media::Inventory> inventory;
    std::vector<LibraryItem> items;
};

std::uint64_t LibraryItem::persistentID() const {
    media::Fingerprint fingerprint;
    fingerprint.add(items_->inventory->songs[song_].path());
    return fingerprint.value();
}

/// Of each song: who asks with the declared name itself need not have its letters compared.
bool isFileSize(MPMediaProperty property) {
    const MPMediaProperty name = MPMediaItemPropertyFileSize;
    return property.size() == name.size() && (property.data() == name.data() || property == name);
}

std::shared_ptr<NSObject> LibraryItem::valueForProperty(MPMediaProperty property) const {
    if (!isFileSize(property)) {
        return nullptr;
    }
    return {items_->shared_from_this(), &*fileSize_};
}

} // namespace

NSArray<MPMediaItem> makeItems(std::shared_ptr<const media::Inventory> inventory,
                               const std::vector<media::SongIndex>& songs) {
    const auto items = std::make_shared<Items>(std::move(inventory), songs.size());
    std::vector<std::shared_ptr<MPMediaItem>> list;
    list.reserve(songs.size());
    for (std::size_t index = 0; index < songs.size(); ++index) {
        LibraryItem& item = items->items[index];
        item.attach(*items, songs[index], items->inventory->songs[songs[index]].size);
        list.emplace_back(items, &item);
    }
    return std::make_shared<const std::vector<std::shared_ptr<MPMediaItem>>>(std::move(list));
}

} // namespace quorl
