#pragma once

#include "doubles/library/EntityDouble.h"

namespace quorl {

/// Sizes of songs in bytes; null for one that is not known.
using SongSizes = std::vector<std::optional<std::uint64_t>>;

/// What a playlist is. Without more than an id and a name it is an ordinary and empty one.
struct PlaylistDescription {
    std::uint64_t id = 0;
    std::optional<std::string> name;
    std::optional<std::uint64_t> revision;
    bool isFolder = false;
    bool isAugurMix = false;
    bool isAugurPlaylist = false;
    SongSizes songSizes;
    bool isFresh = false; ///< another object than the one that had the id before
};

/// A playlist that becomes whatever it is described as. Main thread.
class PlaylistDouble final : public EntityDouble<MPMediaPlaylist> {
  public:
    PlaylistDouble(const PlaylistDescription& description, std::shared_ptr<CallRecorder> recorder);

    /// Takes all over but the id.
    void describe(const PlaylistDescription& description);

    void setName(std::optional<std::string> name) { name_ = std::move(name); }

    /// Null: the property is missing.
    void setRevision(std::optional<std::uint64_t> revision);

    /// One song for each size, in this order, with ids from 1 on.
    void setSongSizes(const SongSizes& sizes);

    [[nodiscard]] std::optional<std::string> name() const override { return name_; }

    [[nodiscard]] NSArray<MPMediaItem> items() const override { return songs_; }

  private:
    std::optional<std::string> name_;
    NSArray<MPMediaItem> songs_;
};

} // namespace quorl
