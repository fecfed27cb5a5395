#include "doubles/library/LibraryDouble.h"

#include <map>

namespace quorl {

void LibraryDouble::replace(const std::vector<PlaylistDescription>& playlists) {
    std::multimap<std::uint64_t, std::shared_ptr<PlaylistDouble>> earlier;
    for (auto& playlist : std::exchange(playlists_, {})) {
        earlier.emplace(playlist->persistentID(), std::move(playlist));
    }
    for (const PlaylistDescription& description : playlists) {
        const auto same = earlier.extract(description.id);
        if (same.empty() || description.isFresh) {
            addPlaylist(description);
        } else {
            same.mapped()->describe(description);
            playlists_.push_back(std::move(same.mapped()));
        }
    }
}

std::shared_ptr<PlaylistDouble> LibraryDouble::addPlaylist(const PlaylistDescription& description) {
    return playlists_.emplace_back(std::make_shared<PlaylistDouble>(description, recorder_));
}

std::shared_ptr<PlaylistDouble> LibraryDouble::addPlaylist(std::uint64_t id,
                                                           std::optional<std::string> name) {
    PlaylistDescription description;
    description.id = id;
    description.name = std::move(name);
    return addPlaylist(description);
}

void LibraryDouble::removePlaylist(const std::shared_ptr<PlaylistDouble>& playlist) {
    std::erase(playlists_, playlist);
}

std::shared_ptr<PlaylistDouble> LibraryDouble::playlist(std::uint64_t id) const {
    const auto found =
        std::find_if(playlists_.begin(), playlists_.end(),
                     [id](const auto& playlist) { return playlist->persistentID() == id; });
    return found == playlists_.end() ? nullptr : *found;
}

bool LibraryDouble::hasMediaOfType(NSUInteger mask) const {
    recorder_->libraryWillLookForMedia(mask);
    if (const auto act = std::exchange(duringQuestion_, nullptr)) {
        act();
    }
    return (mediaTypes_ & mask) != 0;
}

NSArray<MPMediaPlaylist> LibraryDouble::playlistsMatching(const Predicates& predicates) const {
    std::vector<std::shared_ptr<MPMediaPlaylist>> matching;
    std::copy_if(playlists_.begin(), playlists_.end(), std::back_inserter(matching),
                 [&predicates](const auto& playlist) { return fulfils(*playlist, predicates); });
    recorder_->libraryDidFindPlaylists(predicates, matching.size());
    return std::make_shared<const std::vector<std::shared_ptr<MPMediaPlaylist>>>(
        std::move(matching));
}

void LibraryDouble::beginGeneratingLibraryChangeNotifications() {
    recorder_->libraryWillBeginNotifications();
    AnnouncingLibrary::beginGeneratingLibraryChangeNotifications();
}

void LibraryDouble::endGeneratingLibraryChangeNotifications() {
    recorder_->libraryWillEndNotifications();
    AnnouncingLibrary::endGeneratingLibraryChangeNotifications();
}

} // namespace quorl
