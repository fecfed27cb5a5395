#include "quorl-simulate/Life.h"

#include <algorithm>
#include <array>
#include <sstream>
#include <utility>

#include "quorl-simulate/Random.h"

namespace quorl::simulation {

namespace {

/// In the order of `Happening`; how often it happens.
constexpr std::array<std::pair<std::string_view, std::uint64_t>, 39> happenings{{
    {"choose", 8},
    {"change-list", 10},
    {"reorder-list", 3},
    {"empty-list", 1},
    {"rename-list", 2},
    {"delete-list", 1},
    {"add-song", 6},
    {"change-song", 8},
    {"replace-song", 2},
    {"remove-song", 4},
    {"lock-song", 2},
    {"empty-song", 1},
    {"huge-song", 1},
    {"set-limit", 4},
    {"toggle-sync", 3},
    {"toggle-charger", 3},
    {"toggle-plug", 4},
    {"fill", 2},
    {"nearly-fill", 2},
    {"free", 5},
    {"toggle-read-only", 2},
    {"toggle-slowness", 1},
    {"fail-operations", 5},
    {"fail-sync", 5},
    {"add-file", 5},
    {"rename-file", 4},
    {"remove-file", 2},
    {"remove-ours", 2},
    {"change-ours", 1},
    {"damage", 1},
    {"kill", 6},
    {"end", 3},
    {"lose-power", 8},
    {"fail-preferences", 2},
    {"set-calendar", 1},
    {"swap", 2},
    {"start-now", 2},
    {"cancel", 1},
    {"remove-music", 0}, // only where it is wished for, so that lives stay as they are
}};

constexpr std::uint64_t weightOfAll = [] {
    std::uint64_t sum = 0;
    for (const auto& [name, weight] : happenings) {
        sum += weight;
    }
    return sum;
}();

Happening drawHappening(Random& random) {
    auto place = random.below(weightOfAll);
    std::size_t index = 0;
    while (place >= happenings.at(index).second) {
        place -= happenings.at(index).second;
        ++index;
    }
    return static_cast<Happening>(index);
}

/// Some come at once, some in the middle of a copy, some when all is done.
std::uint64_t drawWait(Random& random) {
    constexpr std::array<std::uint64_t, 3> longest{3, 30, 150};
    return random.below(longest.at(random.indexBelow(longest.size())));
}

std::optional<Event> parseEvent(const std::string& word) {
    std::istringstream parts(word);
    std::string name;
    Event event;
    char colon = 0;
    std::getline(parts, name, ':');
    const auto found =
        std::ranges::find(happenings, name, &std::pair<std::string_view, std::uint64_t>::first);
    if (found == happenings.end() || !(parts >> event.wait >> colon >> event.seed)) {
        return std::nullopt;
    }
    event.what = static_cast<Happening>(found - happenings.begin());
    return event;
}

} // namespace

std::string_view nameOf(Happening what) {
    return happenings.at(static_cast<std::size_t>(what)).first;
}

Life drawLife(std::uint64_t seed, DiskRules rules, std::size_t events) {
    Random random(seed);
    Life life{seed, rules, {}, Plant::None};
    for (std::size_t count = 0; count < events; ++count) {
        constexpr std::uint64_t shortSeeds = 100'000;
        const auto what = drawHappening(random);
        const auto wait = drawWait(random);
        life.events.push_back({what, wait, random.below(shortSeeds)});
    }
    return life;
}

std::string toText(const Life& life) {
    std::string text = life.rules == DiskRules::Posix ? "posix " : "fat ";
    text += std::to_string(life.seed);
    for (const auto& event : life.events) {
        text.append(" ").append(nameOf(event.what));
        text += ":" + std::to_string(event.wait) + ":" + std::to_string(event.seed);
    }
    return text;
}

std::optional<Life> parseLife(std::string_view line) {
    std::istringstream words(std::string(line.substr(0, line.find(" # "))));
    std::string device;
    Life life;
    if (!(words >> device >> life.seed) || (device != "posix" && device != "fat")) {
        return std::nullopt;
    }
    life.rules = device == "posix" ? DiskRules::Posix : DiskRules::Fat;
    for (std::string word; words >> word;) {
        const auto event = parseEvent(word);
        if (!event) {
            return std::nullopt;
        }
        life.events.push_back(*event);
    }
    return life;
}

} // namespace quorl::simulation
