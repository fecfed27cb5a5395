#pragma once

#include <map>
#include <optional>
#include <string>
#include <string_view>

#include "services/media/Inventory.h"

namespace quorl::media {

/// Tells songs from other files by their content type, and remembers the answer for each extension.
/// For one thread at a time.
class ContentKinds {
  public:
    /// The kind of the regular file `name` in the open directory `directory`; null: not a song. The
    /// name decides; the first bytes of the file are read only where the name says nothing.
    [[nodiscard]] std::optional<Kind> kindOf(int directory, const char* name);

    /// False: the name alone says that this is no song.
    [[nodiscard]] bool mayBeSong(std::string_view name);

  private:
    enum class Told : std::uint8_t { Audio, MusicVideo, Other, Nothing };

    Told toldByName(std::string_view name);

    /// By extension with its dot, in the case in which it was met.
    std::map<std::string, Told, std::less<>> byExtension_;
};

} // namespace quorl::media
