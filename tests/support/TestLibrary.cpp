#include "tests/support/TestLibrary.h"

#include <algorithm>

namespace quorl::tests {

void TestPlaylist::setRevision(std::uint64_t revision) {
    setProperty(MPMediaEntityPropertyEntityRevision,
                NSNumber::numberWithUnsignedLongLong(revision));
}

void TestPlaylist::setSongSizes(const std::vector<std::optional<std::uint64_t>>& sizes) {
    std::vector<std::shared_ptr<MPMediaItem>> songs;
    for (const auto& size : sizes) {
        const auto song = std::make_shared<TestItem>(songs.size() + 1, journal());
        if (size) {
            song->setProperty(MPMediaItemPropertyFileSize,
                              NSNumber::numberWithUnsignedLongLong(*size));
        }
        songs.push_back(song);
    }
    items_ = std::make_shared<const std::vector<std::shared_ptr<MPMediaItem>>>(std::move(songs));
}

std::shared_ptr<TestPlaylist> TestLibrary::addPlaylist(std::uint64_t persistentID,
                                                       std::optional<std::string> name) {
    const auto playlist = std::make_shared<TestPlaylist>(persistentID, journal_);
    playlist->setName(std::move(name));
    playlist->setProperty(MPMediaPlaylistPropertyPersistentID,
                          NSNumber::numberWithUnsignedLongLong(persistentID));
    for (const auto property : {MPMediaPlaylistPropertyIsFolder, MPMediaPlaylistPropertyIsAugurMix,
                                MPMediaPlaylistPropertyIsAugurPlaylist}) {
        playlist->setProperty(property, NSNumber::numberWithBool(false));
    }
    playlists_.push_back(playlist);
    return playlist;
}

void TestLibrary::removePlaylist(const std::shared_ptr<TestPlaylist>& playlist) {
    std::erase(playlists_, playlist);
}

bool TestLibrary::hasMediaOfType(NSUInteger mask) const {
    journal_.note("library hasMediaOfType " + std::to_string(mask));
    if (const auto act = std::exchange(duringQuestion_, nullptr)) {
        act();
    }
    return (mediaTypes_ & mask) != 0;
}

void TestLibrary::beginGeneratingLibraryChangeNotifications() {
    journal_.note("library begin");
    AnnouncingLibrary::beginGeneratingLibraryChangeNotifications();
}

void TestLibrary::endGeneratingLibraryChangeNotifications() {
    journal_.note("library end");
    AnnouncingLibrary::endGeneratingLibraryChangeNotifications();
}

NSArray<MPMediaPlaylist> TestLibrary::playlistsMatching(const Predicates& predicates) const {
    std::string line = "query";
    for (const auto& predicate : predicates) {
        line += " " + std::string(predicate->property()) + "=" +
                std::to_string(predicate->value()->unsignedLongLongValue());
    }
    journal_.note(std::move(line));
    std::vector<std::shared_ptr<MPMediaPlaylist>> matching;
    std::copy_if(playlists_.begin(), playlists_.end(), std::back_inserter(matching),
                 [&predicates](const auto& playlist) { return fulfils(*playlist, predicates); });
    return std::make_shared<const std::vector<std::shared_ptr<MPMediaPlaylist>>>(
        std::move(matching));
}

} // namespace quorl::tests
