#include "services/finding/Finder.h"

#include <cstdlib>
#include <memory>
#include <utility>

namespace quorl::finding {

namespace {

Found foundIn(const Surroundings& surroundings, const std::filesystem::path& home, Looks& looks) {
    const auto places = placesIn(surroundings, home);
    return {surroundings, offersIn(surroundings, places, looks.at(places))};
}

} // namespace

Finder::Finder(Tell tell, std::filesystem::path home, Sources sources)
    : watch_([tell = std::move(tell), home = std::move(home), looks = std::make_shared<Looks>()](
                 const Surroundings& surroundings) { tell(foundIn(surroundings, home, *looks)); },
             std::move(sources)) {}

Found findNow(const std::filesystem::path& home, const Sources& sources) {
    Looks looks;
    return foundIn(survey(sources), home, looks);
}

std::filesystem::path homeDirectory() {
    const char* const home = std::getenv("HOME");
    return home != nullptr && *home == '/' ? std::filesystem::path(home) : std::filesystem::path();
}

} // namespace quorl::finding
