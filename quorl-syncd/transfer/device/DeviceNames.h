#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <unordered_map>
#include <unordered_set>

namespace quorl::syncd {

/// `name` as every file system of a wearable can hold it, FAT above all: characters, endings and
/// device names that FAT does not allow are replaced, and it has at most 255 bytes of UTF-8, which
/// are at most 255 units of UTF-16. Valid UTF-8, not empty, not hidden, and never a path.
[[nodiscard]] std::string deviceName(std::string_view name);

/// The names in one directory of a file system that does not tell capital letters from small ones.
class TakenNames {
  public:
    void add(std::string_view name);

    /// Takes `name`, made fit for the device, or a numbered variant of it where that is taken:
    /// "Song.mp3", "Song (2).mp3", ….
    [[nodiscard]] std::string take(std::string_view name);

    /// How often it was looked whether a name is taken.
    [[nodiscard]] std::size_t lookUps() const { return lookUps_; }

  private:
    [[nodiscard]] bool insert(std::string_view name);

    std::unordered_set<std::string> folded_;
    /// For names that were wished for before, the number to go on with.
    std::unordered_map<std::string, int> numbers_;
    std::size_t lookUps_ = 0;
};

} // namespace quorl::syncd
