#pragma once

#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

#include "services/media/playlists/TextList.h"

namespace quorl::media {

/// Names, each of which is found in the same time however many there are.
class NameTable {
  public:
    NameTable() = default;

    /// No two of `names` are the same.
    explicit NameTable(TextList names);

    [[nodiscard]] std::uint32_t size() const { return names_.size(); }

    /// The name at `index`, which is below `size()`.
    [[nodiscard]] std::string_view operator[](std::uint32_t index) const { return names_[index]; }

    /// Where `name` is; null: it is not there.
    [[nodiscard]] std::optional<std::uint32_t> find(std::string_view name) const;

    bool operator==(const NameTable& other) const { return names_ == other.names_; }

  private:
    TextList names_;
    /// Of a power of two at least twice as many as names. The index of each name is at the place
    /// that its hash gives, or at the next free one.
    std::vector<std::uint32_t> places_;
};

} // namespace quorl::media
