#include "quorl/commands/WearableList.h"

#include <iostream>

#include <nlohmann/json.hpp>

#include "quorl/app/Printing.h"
#include "services/base/Utf8.h"
#include "services/finding/Finder.h"
#include "services/preferences/ChosenPlaces.h"

namespace quorl {

namespace {

using Json = nlohmann::ordered_json;

/// Empty for the embedded one, as for nothing that was ever chosen.
finding::Chosen chosenWearable() {
    const auto opened = preferences::SharedPreferences::open({});
    if (!opened.preferences) {
        std::cerr << "quorl: " << opened.problem << '\n';
        return {};
    }
    return finding::chosenIn(preferences::chosenWearable(*opened.preferences),
                             opened.preferences->get(preferences::wearableIdentity));
}

std::string figure(const finding::Offer& offer, std::uint64_t finding::Space::*figure) {
    return offer.space ? std::to_string((*offer.space).*figure) : std::string();
}

void printLine(const finding::Offer& offer, bool isChosen) {
    // Neither tabs nor line ends of names are left.
    std::cout << (isChosen ? "*" : "") << '\t' << figure(offer, &finding::Space::available) << '\t'
              << figure(offer, &finding::Space::capacity) << '\t' << base::printable(offer.name)
              << '\t' << base::printable(offer.directory.string()) << '\n';
}

Json jsonOf(const finding::Offer& offer, bool isChosen) {
    return {{"name", offer.name},
            {"directory", offer.isEmbedded() ? Json() : Json(offer.directory.string())},
            {"embedded", offer.isEmbedded()},
            {"chosen", isChosen},
            {"hasMusic", offer.hasManifest},
            {"ejectable", offer.removal.has_value()},
            {"uuid", offer.identity ? Json(offer.identity->uuid) : Json()},
            {"capacityBytes", offer.space ? Json(offer.space->capacity) : Json()},
            {"availableBytes", offer.space ? Json(offer.space->available) : Json()}};
}

} // namespace

ExitCode printWearables(const Options& options) {
    const auto found = finding::findNow(finding::homeDirectory());
    const auto* const chosen =
        finding::chosenOf(found.offers, chosenWearable(), found.surroundings);
    auto list = Json::array();
    for (const auto& offer : found.offers) {
        if (options.json) {
            list.push_back(jsonOf(offer, &offer == chosen));
        } else {
            printLine(offer, &offer == chosen);
        }
    }
    if (options.json) {
        constexpr bool asciiOnly = true; // names of others must not steer a terminal
        std::cout << list.dump(2, ' ', asciiOnly, Json::error_handler_t::replace) << '\n';
    }
    return finishPrinting();
}

} // namespace quorl
