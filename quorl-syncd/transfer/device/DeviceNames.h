#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <unordered_map>
#include <unordered_set>

#include "services/wearable/ContentHash.h"

namespace quorl::syncd {

/// `name` as every file system of a wearable can hold it, FAT above all: characters, endings and
/// device names that FAT does not allow are replaced, and it has at most 255 bytes of UTF-8, which
/// are at most 255 units of UTF-16. Valid UTF-8, not empty, not hidden, and never a path.
[[nodiscard]] std::string deviceName(std::string_view name);

/// The names in one directory of a file system that does not tell capital letters from small ones.
/// Only their hashes are kept: were two of them ever the same, a name would count as taken that is
/// free, and another one be given out.
class TakenNames {
  public:
    void add(std::string_view name);

    /// Takes `name`, made fit for the device, or a numbered variant of it where that is taken:
    /// "Song.mp3", "Song (2).mp3", ….
    [[nodiscard]] std::string take(std::string_view name);

    /// How often it was looked whether a name is taken.
    [[nodiscard]] std::size_t lookUps() const { return lookUps_; }

  private:
    /// Of a name as it is compared.
    using Key = wearable::Digest;

    struct HashOfKey {
        std::size_t operator()(const Key& key) const { return static_cast<std::size_t>(key.low); }
    };

    [[nodiscard]] static Key keyOf(std::string_view name);
    [[nodiscard]] bool insert(const Key& key);

    std::unordered_set<Key, HashOfKey> taken_;
    /// For names that were wished for before, the number to go on with.
    std::unordered_map<Key, int, HashOfKey> numbers_;
    std::size_t lookUps_ = 0;
};

} // namespace quorl::syncd
