#include "doubles/library/LibraryDouble.h"

#include <algorithm>
#include <map>

namespace quorl {

namespace {

class ScriptedItem final : public MPMediaItem {
  public:
    ScriptedItem(std::uint64_t position, std::optional<std::uint64_t> size)
        : position_(position), size_(size) {}

    [[nodiscard]] std::uint64_t persistentID() const override { return position_; }

    [[nodiscard]] std::shared_ptr<NSObject>
    valueForProperty(MPMediaProperty property) const override {
        return property == MPMediaItemPropertyFileSize && size_
                   ? NSNumber::numberWithUnsignedLongLong(*size_)
                   : nullptr;
    }

  private:
    std::uint64_t position_; ///< in its playlist, from 1 on
    std::optional<std::uint64_t> size_;
};

NSArray<MPMediaItem> itemsOf(const PlaylistDescription& description) {
    std::vector<std::shared_ptr<MPMediaItem>> items;
    items.reserve(description.itemSizes.size());
    for (const auto& size : description.itemSizes) {
        items.push_back(std::make_shared<ScriptedItem>(items.size() + 1, size));
    }
    return std::make_shared<const std::vector<std::shared_ptr<MPMediaItem>>>(std::move(items));
}

using Property = std::shared_ptr<NSNumber> (*)(const PlaylistDescription&);

const std::map<MPMediaProperty, Property>& playlistProperties() {
    using Description = PlaylistDescription;
    static const std::map<MPMediaProperty, Property> properties{
        {MPMediaPlaylistPropertyPersistentID,
         [](const Description& it) { return NSNumber::numberWithUnsignedLongLong(it.id); }},
        {MPMediaPlaylistPropertyIsFolder,
         [](const Description& it) { return NSNumber::numberWithBool(it.isFolder); }},
        {MPMediaPlaylistPropertyIsAugurMix,
         [](const Description& it) { return NSNumber::numberWithBool(it.isAugurMix); }},
        {MPMediaPlaylistPropertyIsAugurPlaylist,
         [](const Description& it) { return NSNumber::numberWithBool(it.isAugurPlaylist); }},
        {MPMediaEntityPropertyEntityRevision, [](const Description& it) {
             return it.revision ? NSNumber::numberWithUnsignedLongLong(*it.revision) : nullptr;
         }}};
    return properties;
}

/// Ids are texts in JSON, and every other property that can be asked for is a truth value.
Json valueOf(const MPMediaPropertyPredicate& predicate) {
    const auto& value = predicate.value();
    if (!value) {
        return nullptr;
    }
    if (predicate.property() == MPMediaPlaylistPropertyPersistentID) {
        return std::to_string(value->unsignedLongLongValue());
    }
    return value->boolValue();
}

Json descriptionOf(const AnnouncingLibrary::Predicates& predicates) {
    Json list = Json::array();
    for (const auto& predicate : predicates) {
        list.push_back(Json::array({predicate->property(), valueOf(*predicate),
                                    static_cast<NSInteger>(predicate->comparisonType())}));
    }
    return list;
}

} // namespace

class ScriptedPlaylist final : public MPMediaPlaylist {
  public:
    void describe(const PlaylistDescription& description) {
        description_ = description;
        items_ = itemsOf(description);
    }

    [[nodiscard]] std::uint64_t id() const { return description_.id; }

    [[nodiscard]] std::uint64_t persistentID() const override { return description_.id; }

    [[nodiscard]] std::optional<std::string> name() const override { return description_.name; }

    [[nodiscard]] NSArray<MPMediaItem> items() const override { return items_; }

    [[nodiscard]] std::shared_ptr<NSObject>
    valueForProperty(MPMediaProperty property) const override {
        const auto found = playlistProperties().find(property);
        return found == playlistProperties().end() ? nullptr : found->second(description_);
    }

  private:
    PlaylistDescription description_;
    NSArray<MPMediaItem> items_;
};

void ScriptedLibrary::replace(const std::vector<PlaylistDescription>& playlists,
                              NSUInteger mediaTypes) {
    std::multimap<std::uint64_t, std::shared_ptr<ScriptedPlaylist>> earlier;
    for (auto& playlist : playlists_) {
        earlier.emplace(playlist->id(), std::move(playlist));
    }
    playlists_.clear();
    for (const PlaylistDescription& description : playlists) {
        const auto same = earlier.find(description.id);
        auto playlist = std::make_shared<ScriptedPlaylist>();
        if (same != earlier.end()) {
            playlist = description.isFresh ? playlist : std::move(same->second);
            earlier.erase(same);
        }
        playlist->describe(description);
        playlists_.push_back(std::move(playlist));
    }
    mediaTypes_ = mediaTypes;
}

bool ScriptedLibrary::hasMediaOfType(NSUInteger mask) const {
    trace_->record("MPMediaLibrary", "hasMediaOfType:", mask);
    return (mediaTypes_ & mask) != 0;
}

NSArray<MPMediaPlaylist> ScriptedLibrary::playlistsMatching(const Predicates& predicates) const {
    std::vector<std::shared_ptr<MPMediaPlaylist>> matching;
    std::copy_if(playlists_.begin(), playlists_.end(), std::back_inserter(matching),
                 [&predicates](const auto& playlist) { return fulfils(*playlist, predicates); });
    trace_->record("MPMediaQuery", "collections", descriptionOf(predicates), matching.size());
    return std::make_shared<const std::vector<std::shared_ptr<MPMediaPlaylist>>>(
        std::move(matching));
}

void ScriptedLibrary::beginGeneratingLibraryChangeNotifications() {
    trace_->record("MPMediaLibrary", "beginGeneratingLibraryChangeNotifications");
    AnnouncingLibrary::beginGeneratingLibraryChangeNotifications();
}

void ScriptedLibrary::endGeneratingLibraryChangeNotifications() {
    trace_->record("MPMediaLibrary", "endGeneratingLibraryChangeNotifications");
    AnnouncingLibrary::endGeneratingLibraryChangeNotifications();
}

} // namespace quorl
