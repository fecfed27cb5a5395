#include "quorl/reports/StatusReport.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <condition_variable>
#include <iostream>
#include <mutex>
#include <optional>
#include <string_view>
#include <utility>
#include <vector>

#include <nlohmann/json.hpp>

#include "runtime/services/SizeText.h"
#include "services/base/Utf8.h"
#include "services/engine/Client.h"
#include "services/engine/Message.h"
#include "services/engine/RunningSession.h"
#include "services/language/Languages.h"
#include "services/language/Numbers.h"
#include "services/language/Translated.h"
#include "services/media/playlists/LeftOut.h"
#include "services/preferences/SharedPreferences.h"

namespace quorl {

using language::filled;
using language::toTranslate;
using language::translated;

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

/// Translations align what stands behind the colons, as English does.
void printLine(const std::string& pattern,
               const std::vector<std::pair<std::string_view, std::string>>& texts) {
    std::cout << filled(pattern, texts) << '\n';
}

/// Some other engine may have words that nobody here knows.
std::string explanationOf(const std::string& code) {
    const auto explanation = engine::sentence(engine::Message{code});
    return base::printable(explanation.empty() ? code : explanation);
}

struct StateLine {
    std::string_view state;
    const char* line;
};

/// The same for a word of its SyncState.
std::string lineFor(const std::string& state) {
    constexpr std::array lines{StateLine{engine::syncOff, toTranslate("Sync:       off")},
                               StateLine{engine::syncPending, toTranslate("Sync:       pending")},
                               StateLine{engine::syncSyncing, toTranslate("Sync:       syncing")},
                               StateLine{engine::syncSynced, toTranslate("Sync:       synced")},
                               StateLine{engine::syncUnknown, toTranslate("Sync:       unknown")}};
    const auto* const found = std::ranges::find(lines, state, &StateLine::state);
    return found == lines.end()
               ? filled(translated("Sync:       {state}"), {{"state", base::printable(state)}})
               : translated(found->line);
}

void printLeftOut(const engine::EngineStatus& engine) {
    constexpr std::size_t mostShown = 3;
    if (engine.leftOutCount == 0) {
        return;
    }
    printLine(translated("Left out:   {count}"),
              {{"count", language::numberText(engine.leftOutCount)}});
    const auto shown = std::min(mostShown, engine.leftOut.size());
    for (std::size_t index = 0; index < shown; ++index) {
        const auto& entry = engine.leftOut[index];
        std::cout << "  " << media::describe(entry.get<0>(), explanationOf(entry.get<1>())) << '\n';
    }
    if (engine.leftOutCount > shown) {
        std::cout << "  "
                  << language::translatedCount("and {count} more; see quorl --library",
                                               "and {count} more; see quorl --library",
                                               engine.leftOutCount - shown)
                  << '\n';
    }
}

void printChoice(const engine::EngineState& state, const Choice& choice) {
    const bool isKnown = choice.state != engine::syncUnknown;
    printLine(!choice.playlist.empty() ? translated("Playlist:   {playlist}")
              : isKnown                ? translated("Playlist:   none")
                                       : translated("Playlist:   unknown"),
              {{"playlist", base::printable(choice.playlist)}});
    const auto progress = progressOf(state);
    printLine(progress ? translated("{state}, {percent}") : "{state}",
              {{"state", lineFor(choice.state)},
               {"percent", language::percentText(progress.value_or(0))}});
}

void printWearable(const engine::WearableStatus& wearable) {
    printLine(translated("Wearable:   {name}, {connection}, {charger}"),
              {{"name", base::printable(wearable.name)},
               {"connection", translated(wearable.isConnected ? toTranslate("connected")
                                                              : toTranslate("not connected"))},
               {"charger", translated(wearable.isOnCharger ? toTranslate("on its charger")
                                                           : toTranslate("not on its charger"))}});
    printLine(translated("Storage:    {available} of {capacity} free, {songs} in songs"),
              {{"available", size(wearable.available)},
               {"capacity", size(wearable.capacity)},
               {"songs", size(wearable.songs)}});
}

void printText(const engine::EngineState& state, const Choice& choice) {
    printChoice(state, choice);
    if (!state.isThere) {
        printLine(translated("Engine:     not running; start quorl-syncd, or log in again"), {});
        return;
    }
    const auto& engine = state.engine;
    printLine(translated("Engine:     {status}"), {{"status", base::printable(engine.status)}});
    printWearable(state.wearable);
    printLine(engine.lastTime == 0 ? translated("Last sync:  not yet")
                                   : translated("Last sync:  {result}"),
              {{"result", base::printable(engine.lastMessage)}});
    printLeftOut(engine);
}

} // namespace

ExitCode printStatus(const Options& options) {
    if (options.json) {
        language::followLanguages({}); // programs read the same in every language
    }
    const auto asked = askEngine();
    if (!asked) {
        std::cerr << "quorl: "
                  << translated(
                         "The sync engine does not answer. End quorl-syncd, then start it again.")
                  << '\n';
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
