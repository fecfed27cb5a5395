#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <variant>

#include "services/media/FolderTree.h"
#include "services/media/playlists/LeftOut.h"
#include "services/media/playlists/PlaylistContent.h"

namespace quorl::media {

/// A song that an entry means.
struct FoundSong {
    Directory* directory;
    SongFile* file;
};

using Resolved = std::variant<FoundSong, Reason>;

/// As long as what stays the same, an entry means the same.
enum class Basis : std::uint8_t {
    Text,  ///< The entry itself.
    Song,  ///< The directory of the song that was found, and the song in it.
    Names, ///< All directories of the tree and the names of all songs.
    Files  ///< Nothing that is known: the file system was asked.
};

struct Resolution {
    Resolved meaning;
    Basis basis;
};

/// Finds the song that an entry of a playlist means. Most entries are found in the tree, without
/// asking the file system; only what is not there is looked at, to follow links and to tell why.
class EntryResolver {
  public:
    /// `tree` is not changed and outlives the resolver; its `top` is not null.
    explicit EntryResolver(const FolderTree& tree);

    /// The song that `entry` means in a playlist of `format` that lies in `directory`, or why there
    /// is none.
    [[nodiscard]] Resolution resolve(Directory& directory, std::string_view entry,
                                     Format format) const;

  private:
    [[nodiscard]] std::optional<FoundSong> locate(Directory& directory,
                                                  std::string_view path) const;
    [[nodiscard]] std::optional<FoundSong> locateInOtherNormalisation(Directory& directory,
                                                                      std::string_view path) const;
    [[nodiscard]] std::optional<Resolution> find(Directory& directory, std::string_view path) const;
    [[nodiscard]] Resolved examine(const Directory& directory, const std::string& path) const;
    [[nodiscard]] Resolved examineExisting(const std::string& path, bool regular) const;
    [[nodiscard]] std::optional<std::string_view> relativeToRoot(std::string_view path) const;

    const FolderTree& tree_;
    /// The music folder as it was given, without a slash at its end: empty for "/".
    std::string givenRoot_;
};

} // namespace quorl::media
