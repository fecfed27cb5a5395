#include "services/finding/Offer.h"

#include <algorithm>
#include <set>
#include <tuple>

namespace quorl::finding {

namespace {

/// A directory within a drive is not what the drive is called after.
std::string nameOf(const std::filesystem::path& directory, const base::Mount* mount,
                   const Drive* drive) {
    const bool isWhole = mount != nullptr && mount->directory == directory;
    if (isWhole && drive != nullptr && !drive->label.empty()) {
        return drive->label;
    }
    const auto name = directory.filename().string();
    return name.empty() ? directory.string() : name;
}

Offer offerAt(const std::filesystem::path& directory, const Surroundings& surroundings,
              const Find& found, bool hasManifest) {
    const auto* const mount = base::mountOver(directory, surroundings.mounts);
    const auto* const drive = mount == nullptr ? nullptr : driveOf(*mount, surroundings.drives);
    return {nameOf(directory, mount, drive),
            directory,
            found.space,
            hasManifest,
            chosenAt(directory, surroundings).identity,
            drive == nullptr ? std::nullopt : drive->removal};
}

bool isBefore(const Offer& one, const Offer& other) {
    return std::tie(other.hasManifest, one.name, one.directory) <
           std::tie(one.hasManifest, other.name, other.directory);
}

} // namespace

std::vector<Offer> offersIn(const Surroundings& surroundings, const std::vector<Place>& places,
                            const std::map<std::filesystem::path, Find>& finds) {
    std::vector<Offer> offers;
    std::set<std::filesystem::path> offered;
    const auto offer = [&](const std::filesystem::path& directory, const Find& found,
                           bool hasManifest) {
        if (offered.insert(directory).second) {
            offers.push_back(offerAt(directory, surroundings, found, hasManifest));
        }
    };
    for (const auto& place : places) {
        const auto found = finds.find(place.directory);
        const auto& find = found == finds.end() ? Find() : found->second;
        for (const auto& directory : find.wearables) {
            offer(directory, find, true);
        }
        if (place.isOfferedEmpty) {
            offer(place.directory, find, false);
        }
    }
    std::ranges::sort(offers, isBefore);
    offers.push_back({.name = embeddedName});
    return offers;
}

const Offer* chosenOf(const std::vector<Offer>& offers, const Chosen& chosen,
                      const Surroundings& surroundings) {
    const auto whereabouts = whereaboutsOf(chosen, surroundings);
    const auto found = std::ranges::find(offers, whereabouts.directory, &Offer::directory);
    return found == offers.end() || !whereabouts.problem.code.empty() ? nullptr : &*found;
}

} // namespace quorl::finding
