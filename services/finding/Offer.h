#pragma once

#include <filesystem>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "services/finding/Chosen.h"
#include "services/finding/Place.h"

namespace quorl::finding {

/// What the wearable in this machine is called among others.
inline constexpr const char* embeddedName = "On this device (for trying out)";

/// A wearable that can be chosen, or a drive that can become one.
struct Offer {
    /// For people: what the drive is called, else the directory. Two may have one name.
    std::string name = {};
    /// Absolute; empty for the embedded one.
    std::filesystem::path directory = {};
    /// Nothing where it did not answer.
    std::optional<Space> space = {};
    /// Music was synced to it before.
    bool hasManifest = false;
    /// What there is to remember of it.
    std::optional<Identity> identity = {};
    /// Nothing where it cannot be ejected.
    std::optional<Removal> removal = {};

    bool operator==(const Offer&) const = default;

    [[nodiscard]] bool isEmbedded() const { return directory.empty(); }
};

/// What to offer, wearables first, then drives that are none yet, both by name, the embedded one at
/// the end. It is offered always.
/// @param finds by the directories of the places
[[nodiscard]] std::vector<Offer> offersIn(const Surroundings& surroundings,
                                          const std::vector<Place>& places,
                                          const std::map<std::filesystem::path, Find>& finds);

/// The offer that was chosen; null where that is none of them.
[[nodiscard]] const Offer* chosenOf(const std::vector<Offer>& offers, const Chosen& chosen,
                                    const Surroundings& surroundings);

} // namespace quorl::finding
