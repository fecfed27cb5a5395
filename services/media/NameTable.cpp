#include "services/media/NameTable.h"

#include <bit>
#include <functional>
#include <limits>
#include <utility>

namespace quorl::media {

namespace {

constexpr std::uint32_t nothing = std::numeric_limits<std::uint32_t>::max();

std::size_t hashOf(std::string_view name) { return std::hash<std::string_view>()(name); }

} // namespace

NameTable::NameTable(TextList names) : names_(std::move(names)) {
    names_.shrink();
    places_.resize(std::bit_ceil(std::size_t{names_.size()} * 2), nothing);
    const std::size_t mask = places_.size() - 1;
    for (std::uint32_t index = 0; index < names_.size(); ++index) {
        std::size_t place = hashOf(names_[index]) & mask;
        while (places_[place] != nothing) {
            place = (place + 1) & mask;
        }
        places_[place] = index;
    }
}

std::optional<std::uint32_t> NameTable::find(std::string_view name) const {
    if (places_.empty()) {
        return std::nullopt;
    }
    const std::size_t mask = places_.size() - 1;
    std::size_t place = hashOf(name) & mask;
    while (places_[place] != nothing && names_[places_[place]] != name) {
        place = (place + 1) & mask;
    }
    return places_[place] == nothing ? std::nullopt : std::optional(places_[place]);
}

} // namespace quorl::media
