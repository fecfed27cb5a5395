#include "quorl/facts/EngineTrouble.h"

#include <algorithm>
#include <array>

#include "services/engine/Codes.h"
#include "services/language/Translated.h"
#include "services/wearable/Unseen.h"

namespace quorl {

using language::translated;

namespace {

/// Ends of a sync that somebody has wished for.
constexpr std::array<std::string_view, 4> wished{engine::code::cancelled, engine::code::ended,
                                                 engine::code::stopped,
                                                 engine::code::somethingElseChosen};

/// Whether the wearable cannot be looked at.
bool isUnseen(const std::string& code) {
    using wearable::unseen::all;
    return code == engine::code::other || std::ranges::find(all, code) != all.end();
}

/// Whether the last sync has failed and is not about to be tried again.
bool hasGivenUp(const engine::EngineStatus& engine) {
    return !engine.lastSuccess && !engine.lastMessage.empty() &&
           engine.status == engine.lastMessage &&
           std::ranges::find(wished, engine.lastCode) == wished.end();
}

} // namespace

std::string nameOf(Remedy remedy) {
    switch (remedy) {
    case Remedy::StartEngine:
        return translated("Start");
    case Remedy::LookAgain:
    case Remedy::TryAgain:
        break;
    }
    return translated("Try Again");
}

EngineLink::Request requestOf(Remedy remedy) {
    // Whatever is asked of an engine that does not run starts it.
    return remedy == Remedy::TryAgain ? &engine::Client::startNow
                                      : &engine::Client::refreshWearable;
}

std::optional<EngineTrouble> troubleIn(const engine::EngineState& state) {
    if (!state.isThere) {
        return EngineTrouble{translated("The sync engine is not running, so nothing is synced."),
                             Remedy::StartEngine};
    }
    const auto& engine = state.engine;
    if (engine.syncState != engine::syncPending) {
        return std::nullopt;
    }
    if (hasGivenUp(engine)) {
        return EngineTrouble{engine.lastMessage, Remedy::TryAgain};
    }
    return isUnseen(engine.statusCode)
               ? std::optional(EngineTrouble{engine.status, Remedy::LookAgain})
               : std::nullopt;
}

} // namespace quorl
