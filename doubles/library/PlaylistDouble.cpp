#include "doubles/library/PlaylistDouble.h"

namespace quorl {

namespace {

using SongDouble = EntityDouble<MPMediaItem>;

std::shared_ptr<NSNumber> numberOrNull(std::optional<std::uint64_t> value) {
    return value ? NSNumber::numberWithUnsignedLongLong(*value) : nullptr;
}

} // namespace

PlaylistDouble::PlaylistDouble(const PlaylistDescription& description,
                               std::shared_ptr<CallRecorder> recorder)
    : EntityDouble(description.id, std::move(recorder)) {
    setProperty(MPMediaPlaylistPropertyPersistentID, numberOrNull(description.id));
    describe(description);
}

void PlaylistDouble::describe(const PlaylistDescription& description) {
    setName(description.name);
    setRevision(description.revision);
    setProperty(MPMediaPlaylistPropertyIsFolder, NSNumber::numberWithBool(description.isFolder));
    setProperty(MPMediaPlaylistPropertyIsAugurMix,
                NSNumber::numberWithBool(description.isAugurMix));
    setProperty(MPMediaPlaylistPropertyIsAugurPlaylist,
                NSNumber::numberWithBool(description.isAugurPlaylist));
    setSongSizes(description.songSizes);
}

void PlaylistDouble::setRevision(std::optional<std::uint64_t> revision) {
    setProperty(MPMediaEntityPropertyEntityRevision, numberOrNull(revision));
}

void PlaylistDouble::setSongSizes(const SongSizes& sizes) {
    std::vector<std::shared_ptr<MPMediaItem>> songs;
    songs.reserve(sizes.size());
    for (const auto& size : sizes) {
        auto song = std::make_shared<SongDouble>(songs.size() + 1, recorder());
        song->setProperty(MPMediaItemPropertyFileSize, numberOrNull(size));
        songs.push_back(std::move(song));
    }
    songs_ = std::make_shared<const std::vector<std::shared_ptr<MPMediaItem>>>(std::move(songs));
}

} // namespace quorl
