#include "quorl/reports/StatusReport.h"

#include <algorithm>
#include <chrono>
#include <condition_variable>
#include <iostream>
#include <mutex>
#include <optional>

#include <nlohmann/json.hpp>

#include "runtime/services/SizeText.h"
#include "services/base/Utf8.h"
#include "services/engine/Client.h"
#include "services/engine/Message.h"
#include "services/engine/RunningSession.h"
#include "services/language/Languages.h"
#include "services/preferences/SharedPreferences.h"

namespace quorl {

namespace {

using Json = nlohmann::ordered_json;

/// How far the chosen playlist is.
struct Choice {
    std::string playlist; ///< empty for none, and where it is not known
    std::string state;    ///< a word of the engine's SyncState
};

/// Whether an event tells all that is asked for: an engine that has just been started knows little.
bool isAnswer(const engine::Event& event) {
    return !event.state->isThere || event.state->engine.syncState != engine::syncUnknown;
}

/// Waits for what the engine has to tell, or for what there is to tell about it; where it does not
/// know more after a while, for what it has told. Nothing where it does not answer.
std::optional<engine::Event> askEngine() {
    constexpr std::chrono::seconds patience{15};
    std::mutex mutex;
    std::condition_variable answered;
    std::optional<engine::Event> answer;
    const engine::Client client([&](const engine::Event& event) {
        const std::scoped_lock lock(mutex);
        if (!answer || !isAnswer(*answer)) {
            answer = event;
            answered.notify_one();
        }
    });
    std::unique_lock lock(mutex);
    answered.wait_for(lock, patience, [&answer] { return answer && isAnswer(*answer); });
    return answer;
}

Choice choiceOf(const engine::EngineStatus& engine) {
    // Some other engine may not tell.
    return {.playlist = engine.playlistName,
            .state = engine.syncState.empty() ? engine::syncUnknown : engine.syncState};
}

/// What is known without an engine: whether there is something to sync at all. What became of it
/// could only be told by reading the music folder. Nothing where there are no preferences either.
std::optional<Choice> choiceWithoutEngine() {
    const auto opened = preferences::SharedPreferences::open({});
    if (!opened.problem.empty()) {
        std::cerr << "quorl: " << opened.problem << '\n';
    }
    if (!opened.preferences) {
        return std::nullopt;
    }
    const bool isWished = opened.preferences->get(preferences::assetSyncEnabled) &&
                          opened.preferences->get(preferences::assetSyncPlaylistPersistentID);
    return Choice{.playlist = {}, .state = isWished ? engine::syncUnknown : engine::syncOff};
}

/// Of the running session; nothing where none is running.
std::optional<double> progressOf(const engine::EngineState& state) {
    const auto* const running = engine::runningSession(state);
    return running ? std::optional<double>(running->progress) : std::nullopt;
}

Json jsonOf(const engine::EngineState& state, const Choice& choice) {
    Json json;
    json["engine"] = state.isThere;
    json["playlist"] = choice.playlist.empty() ? Json() : Json(choice.playlist);
    json["state"] = choice.state;
    const auto progress = progressOf(state);
    json["progress"] = progress ? Json(*progress) : Json();
    json["status"] = state.engine.status;
    json["statusCode"] = state.engine.statusCode;
    json["leftOut"] = state.engine.leftOutCount;
    json["beyondLimit"] = state.engine.beyondLimit;
    json["lastSync"] = state.engine.lastTime == 0
                           ? Json()
                           : Json{{"success", state.engine.lastSuccess},
                                  {"message", state.engine.lastMessage},
                                  {"code", state.engine.lastCode},
                                  {"microsecondsSince1970", state.engine.lastTime}};
    json["lastComplete"] =
        state.engine.lastComplete == 0 ? Json() : Json(state.engine.lastComplete);
    json["wearable"] = {{"name", state.wearable.name},
                        {"directory", state.wearable.directory},
                        {"connected", state.wearable.isConnected},
                        {"onCharger", state.wearable.isOnCharger},
                        {"capacityBytes", state.wearable.capacity},
                        {"availableBytes", state.wearable.available},
                        {"songs", state.wearable.songCount},
                        {"songsBytes", state.wearable.songs}};
    return json;
}

std::string size(std::uint64_t bytes) {
    return sizeText(static_cast<double>(bytes), language::followedLanguages().front());
}

/// Some other engine may have words that nobody here knows.
std::string explanationOf(const std::string& code) {
    const auto explanation = engine::sentence(engine::Message{code});
    return explanation.empty() ? code : explanation;
}

void printLeftOut(const engine::EngineStatus& engine) {
    constexpr std::size_t mostShown = 3;
    if (engine.leftOutCount == 0) {
        return;
    }
    std::cout << "Left out:   " << engine.leftOutCount << '\n';
    const auto shown = std::min(mostShown, engine.leftOut.size());
    for (std::size_t index = 0; index < shown; ++index) {
        const auto& entry = engine.leftOut[index].get<0>();
        std::cout << "  " << base::printable(entry) << (entry.empty() ? "" : ": ")
                  << base::printable(explanationOf(engine.leftOut[index].get<1>())) << '\n';
    }
    if (engine.leftOutCount > shown) {
        std::cout << "  and " << engine.leftOutCount - shown << " more; see quorl --library\n";
    }
}

void printText(const engine::EngineState& state, const Choice& choice) {
    const bool isKnown = choice.state != engine::syncUnknown;
    std::cout << "Playlist:   "
              << (!choice.playlist.empty() ? base::printable(choice.playlist)
                  : isKnown                ? "none"
                                           : "unknown")
              << '\n'
              << "Sync:       " << base::printable(choice.state);
    if (const auto progress = progressOf(state)) {
        std::cout << ", " << static_cast<int>(*progress * 100) << "%";
    }
    std::cout << '\n';
    if (!state.isThere) {
        std::cout << "Engine:     not running; start quorl-syncd, or log in again\n";
        return;
    }
    std::cout << "Engine:     " << base::printable(state.engine.status) << '\n'
              << "Wearable:   " << base::printable(state.wearable.name)
              << (state.wearable.isConnected ? ", connected" : ", not connected")
              << (state.wearable.isOnCharger ? ", on its charger" : ", not on its charger") << '\n'
              << "Storage:    " << size(state.wearable.available) << " of "
              << size(state.wearable.capacity) << " free, " << size(state.wearable.songs)
              << " in songs\n"
              << "Last sync:  "
              << (state.engine.lastTime == 0 ? "not yet"
                                             : base::printable(state.engine.lastMessage))
              << '\n';
    printLeftOut(state.engine);
}

} // namespace

ExitCode printStatus(const Options& options) {
    const auto asked = askEngine();
    if (!asked) {
        std::cerr
            << "quorl: The sync engine does not answer. End quorl-syncd, then start it again.\n";
        return ExitCode::Failure;
    }
    const auto& answer = *asked;
    if (answer.kind == engine::Event::Kind::BusDidVanish) {
        std::cerr << "quorl: " << base::printable(answer.message) << '\n';
        return ExitCode::Failure;
    }
    const auto choice = answer.state->isThere ? std::optional(choiceOf(answer.state->engine))
                                              : choiceWithoutEngine();
    if (!choice) {
        return ExitCode::Failure;
    }
    if (options.json) {
        constexpr bool asciiOnly = true; // names of others must not steer a terminal
        std::cout << jsonOf(*answer.state, *choice)
                         .dump(2, ' ', asciiOnly, Json::error_handler_t::replace)
                  << '\n';
    } else {
        printText(*answer.state, *choice);
    }
    return ExitCode::Success;
}

} // namespace quorl
