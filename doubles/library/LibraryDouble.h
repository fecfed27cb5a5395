#pragma once

#include "quorl-script/Trace.h"
#include "runtime/services/AnnouncingLibrary.h"

namespace quorl {

/// What a script says of a playlist.
struct PlaylistDescription {
    std::uint64_t id = 0;
    std::optional<std::string> name;
    std::optional<std::uint64_t> revision;
    bool isFolder = false;
    bool isAugurMix = false;
    bool isAugurPlaylist = false;
    std::vector<std::optional<std::uint64_t>> itemSizes; ///< bytes; null: the property is missing
    bool isFresh = false; ///< another object than the one that had the id before
};

class ScriptedPlaylist;

/// The media library of a script. Main thread.
class ScriptedLibrary final : public AnnouncingLibrary {
  public:
    explicit ScriptedLibrary(std::shared_ptr<Trace> trace) : trace_(std::move(trace)) {}

    /// Puts other contents in place of these; announces nothing. A playlist whose id stays is the
    /// same object, which takes over what the description says.
    void replace(const std::vector<PlaylistDescription>& playlists, NSUInteger mediaTypes);

    [[nodiscard]] bool hasMediaOfType(NSUInteger mask) const override;
    [[nodiscard]] NSArray<MPMediaPlaylist>
    playlistsMatching(const Predicates& predicates) const override;
    void beginGeneratingLibraryChangeNotifications() override;
    void endGeneratingLibraryChangeNotifications() override;

  private:
    std::shared_ptr<Trace> trace_;
    std::vector<std::shared_ptr<ScriptedPlaylist>> playlists_;
    NSUInteger mediaTypes_ = 0;
};

} // namespace quorl
