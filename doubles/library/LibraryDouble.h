#pragma once

#include <functional>

#include "doubles/library/PlaylistDouble.h"

namespace quorl {

/// A media library in memory, without any media at first. Main thread.
class LibraryDouble final : public AnnouncingLibrary {
  public:
    explicit LibraryDouble(std::shared_ptr<CallRecorder> recorder)
        : recorder_(std::move(recorder)) {}

    /// Puts other playlists in place of these; announces nothing. A playlist whose id stays is the
    /// same object, which takes over what the description says.
    void replace(const std::vector<PlaylistDescription>& playlists);

    /// Adds one at the end; announces nothing.
    std::shared_ptr<PlaylistDouble> addPlaylist(const PlaylistDescription& description);
    std::shared_ptr<PlaylistDouble> addPlaylist(std::uint64_t id, std::optional<std::string> name);

    void removePlaylist(const std::shared_ptr<PlaylistDouble>& playlist);

    /// The first with this id, or null.
    [[nodiscard]] std::shared_ptr<PlaylistDouble> playlist(std::uint64_t id) const;

    /// The types of which the library has items.
    void setMediaTypes(NSUInteger mask) { mediaTypes_ = mask; }

    /// What happens while the library is asked for its types the next time.
    void duringNextQuestion(std::function<void()> act) { duringQuestion_ = std::move(act); }

    [[nodiscard]] bool hasMediaOfType(NSUInteger mask) const override;
    [[nodiscard]] NSArray<MPMediaPlaylist>
    playlistsMatching(const Predicates& predicates) const override;
    void beginGeneratingLibraryChangeNotifications() override;
    void endGeneratingLibraryChangeNotifications() override;

  private:
    std::shared_ptr<CallRecorder> recorder_;
    std::vector<std::shared_ptr<PlaylistDouble>> playlists_;
    NSUInteger mediaTypes_ = 0;
    mutable std::function<void()> duringQuestion_;
};

} // namespace quorl
