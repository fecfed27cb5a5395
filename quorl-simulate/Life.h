#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "quorl-simulate/Plant.h"
#include "quorl-simulate/parts/SimulatedDisk.h"

namespace quorl::simulation {

enum class Happening {
    Choose,
    ChangeList,
    ReorderList,
    EmptyList,
    RenameList,
    DeleteList,
    AddSong,
    ChangeSong,
    ReplaceSongAlike,
    RemoveSong,
    LockSong,
    EmptySong,
    HugeSong,
    SetLimit,
    ToggleSync,
    ToggleCharger,
    TogglePlug,
    FillDevice,
    NearlyFillDevice,
    FreeDevice,
    ToggleReadOnly,
    ToggleSlowness,
    FailOperations,
    FailSync,
    AddFileOfOthers,
    RenameFileOfOthers,
    RemoveFileOfOthers,
    RemoveOurs,
    ChangeOurs,
    DamageManifest,
    KillEngine,
    EndEngine,
    LosePower,
    FailPreferences,
    SetCalendar,
    SwapWearable,
    StartNow,
    Cancel,
    RemoveMusic,
};

/// Something that happens to the engine from outside.
struct Event {
    Happening what = Happening::Choose;
    /// After how many operations or turns it happens, counted from the event before.
    std::uint64_t wait = 0;
    /// What it is done to is drawn from this.
    std::uint64_t seed = 0;

    bool operator==(const Event&) const = default;
};

/// All that one life follows from.
struct Life {
    std::uint64_t seed = 0;
    DiskRules rules = DiskRules::Posix;
    std::vector<Event> events = {};
    Plant plant = Plant::None;

    bool operator==(const Life&) const = default;
};

[[nodiscard]] Life drawLife(std::uint64_t seed, DiskRules rules, std::size_t events);

/// In one line, to be read by `parseLife`.
[[nodiscard]] std::string toText(const Life& life);

/// Nothing where it is not such a line; what follows " # " is left out.
[[nodiscard]] std::optional<Life> parseLife(std::string_view line);

[[nodiscard]] std::string_view nameOf(Happening what);

} // namespace quorl::simulation
