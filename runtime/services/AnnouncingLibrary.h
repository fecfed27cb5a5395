#pragma once

#include "platform/MediaLibrary.h"

namespace quorl {

/// The library without its contents, which a host adds: who wants change notifications is counted
/// and served here. Main thread only.
class AnnouncingLibrary : public MPMediaLibrary {
  public:
    using Predicates = std::vector<std::shared_ptr<MPMediaPropertyPredicate>>;

    /// The playlists that fulfil every predicate, in the library's order; never null.
    [[nodiscard]] virtual NSArray<MPMediaPlaylist>
    playlistsMatching(const Predicates& predicates) const = 0;

    void beginGeneratingLibraryChangeNotifications() override;
    void endGeneratingLibraryChangeNotifications() override;

    /// To be called by the host after the contents have changed: posts
    /// `MPMediaLibraryDidChangeNotification` if somebody wants to know.
    void contentsDidChange();

  private:
    NSUInteger wanted_ = 0;
};

/// Whether an entity fulfils every predicate. A missing property fulfils none.
[[nodiscard]] bool fulfils(const MPMediaEntity& entity,
                           const AnnouncingLibrary::Predicates& predicates);

} // namespace quorl
