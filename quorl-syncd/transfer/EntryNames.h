#pragma once

#include <algorithm>
#include <iterator>
#include <span>
#include <string_view>
#include <vector>

#include "services/wearable/Manifest.h"

namespace quorl::syncd {

/// The names of entries, to look others up among them. The entries stay as they are meanwhile.
class EntryNames {
  public:
    explicit EntryNames(std::span<const wearable::Entry> entries) {
        names_.reserve(entries.size());
        std::ranges::transform(entries, std::back_inserter(names_), &wearable::Entry::name);
        std::ranges::sort(names_);
    }

    [[nodiscard]] bool contains(std::string_view name) const {
        return std::ranges::binary_search(names_, name);
    }

  private:
    std::vector<std::string_view> names_;
};

} // namespace quorl::syncd
