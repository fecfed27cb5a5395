#pragma once

#include <filesystem>
#include <optional>
#include <string>
#include <string_view>

#include "services/finding/Drive.h"
#include "services/language/CodedMessage.h"

namespace quorl::finding {

/// Which drive a wearable is on, wherever that is mounted.
struct Identity {
    /// Of the file system. Not empty.
    std::string uuid;
    /// Where it was mounted when the wearable was chosen. Absolute.
    std::filesystem::path mountPoint;

    bool operator==(const Identity&) const = default;
};

/// "1234-ABCD:/media/me/STICK", as it stands in the settings; an empty text for none.
[[nodiscard]] std::string toText(const std::optional<Identity>& identity);

/// Nothing for a text that is not one of `toText`.
[[nodiscard]] std::optional<Identity> parseIdentity(std::string_view text);

/// The wearable that was chosen for good.
struct Chosen {
    /// Its directory when it was chosen. Absolute; empty for the embedded one.
    std::filesystem::path directory;
    /// Nothing where the path alone counts.
    std::optional<Identity> identity;

    bool operator==(const Chosen&) const = default;
};

/// What the settings say. An identity counts only for a directory on its mount: another directory
/// was written by somebody who knew nothing of it.
[[nodiscard]] Chosen chosenIn(const std::filesystem::path& directory, std::string_view identity);

/// What to remember of a directory that is chosen now: the drive, where it is on one that comes and
/// goes.
[[nodiscard]] Chosen chosenAt(const std::filesystem::path& directory,
                              const Surroundings& surroundings);

/// Where a chosen wearable is.
struct Whereabouts {
    /// Where it was chosen as long as it is nowhere else.
    std::filesystem::path directory;
    /// Why it is not there, as in `wearable::Unseen`; no code where nothing is known against it.
    language::CodedMessage problem = {};

    bool operator==(const Whereabouts&) const = default;
};

[[nodiscard]] Whereabouts whereaboutsOf(const Chosen& chosen, const Surroundings& surroundings);

} // namespace quorl::finding
