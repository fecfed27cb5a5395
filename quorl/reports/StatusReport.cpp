#include "quorl/reports/StatusReport.h"

#include <future>
#include <iostream>

#include <nlohmann/json.hpp>

#include "services/engine/Client.h"
#include "services/media/MusicFolder.h"
#include "services/preferences/SharedPreferences.h"

namespace quorl {

namespace {

using Json = nlohmann::ordered_json;

/// Waits for the first word from the engine, or about it.
class FirstWord final : public engine::Listener {
  public:
    struct Word {
        engine::EngineState state;
        std::string problem; ///< empty where there is a bus
    };

    [[nodiscard]] Word wait() { return word_.get_future().get(); }

    void engineDidAppear(const engine::EngineState& state) override { say({state, {}}); }

    void engineDidVanish(const std::string& /*reason*/) override { say({}); }

    void busDidVanish(const std::string& problem) override { say({{}, problem}); }

  private:
    void say(Word word) {
        if (!isSaid_) {
            isSaid_ = true;
            word_.set_value(std::move(word));
        }
    }

    bool isSaid_ = false; ///< the client's thread only
    std::promise<Word> word_;
};

/// What is chosen, and whether it is on the wearable as it is now.
struct Choice {
    std::string name; ///< empty for no playlist
    const char* state = "off";
};

Choice choiceOf(const preferences::SharedPreferences& preferences, const media::Inventory& library,
                bool isRunning) {
    using namespace preferences;
    const auto id = preferences.get(assetSyncPlaylistPersistentID);
    const auto* playlist =
        preferences.get(assetSyncEnabled) && id ? library.playlist(*id) : nullptr;
    if (!playlist) {
        return {};
    }
    const bool isSent =
        preferences.get(lastFullySentAssetSyncPlaylistPersistentID) == playlist->id &&
        preferences.get(lastFullySentAssetSyncPlaylistVersion) == playlist->revision;
    return {playlist->name, isRunning ? "syncing" : isSent ? "synced" : "pending"};
}

/// The mean progress of the tasks that carry music in sessions that have not finished; null where
/// none is running.
std::optional<double> progressOf(const engine::EngineState& state) {
    double sum = 0;
    int count = 0;
    for (const engine::SessionState& session : state.sessions) {
        for (const engine::TaskState& task : session.tasks) {
            if (!session.isFinished && task.groupingKey == engine::assetGroupingKey) {
                sum += task.progress;
                ++count;
            }
        }
    }
    return count == 0 ? std::nullopt : std::optional(sum / count);
}

bool isRunning(const engine::EngineState& state) {
    return std::any_of(state.sessions.begin(), state.sessions.end(),
                       [](const engine::SessionState& session) { return !session.isFinished; });
}

Json jsonOf(const engine::EngineState& state, const Choice& choice) {
    Json json;
    json["engine"] = state.isThere;
    json["playlist"] = choice.name.empty() ? Json() : Json(choice.name);
    json["state"] = choice.state;
    const auto progress = progressOf(state);
    json["progress"] = progress ? Json(*progress) : Json();
    json["status"] = state.engine.status;
    json["lastSync"] = state.engine.lastTime == 0
                           ? Json()
                           : Json{{"success", state.engine.lastSuccess},
                                  {"message", state.engine.lastMessage},
                                  {"microsecondsSince1970", state.engine.lastTime}};
    json["wearable"] = {{"name", state.wearable.name},
                        {"directory", state.wearable.directory},
                        {"connected", state.wearable.isConnected},
                        {"onCharger", state.wearable.isOnCharger},
                        {"capacityBytes", state.wearable.capacity},
                        {"availableBytes", state.wearable.available},
                        {"songsBytes", state.wearable.songs}};
    return json;
}

void printText(const engine::EngineState& state, const Choice& choice) {
    std::cout << "Playlist:   " << (choice.name.empty() ? "none" : choice.name) << '\n'
              << "Sync:       " << choice.state;
    if (const auto progress = progressOf(state)) {
        std::cout << ", " << static_cast<int>(*progress * 100) << "%";
    }
    std::cout << '\n';
    if (!state.isThere) {
        std::cout << "Engine:     not running; start quorl-syncd, or log in again\n";
        return;
    }
    std::cout << "Engine:     " << state.engine.status << '\n'
              << "Wearable:   " << state.wearable.name
              << (state.wearable.isConnected ? ", connected" : ", not connected")
              << (state.wearable.isOnCharger ? ", on its charger" : ", not on its charger") << '\n'
              << "Storage:    " << state.wearable.available << " of " << state.wearable.capacity
              << " bytes free, " << state.wearable.songs << " in songs\n"
              << "Last sync:  "
              << (state.engine.lastTime == 0 ? "not yet" : state.engine.lastMessage) << '\n';
}

} // namespace

ExitCode printStatus(const Options& options) {
    FirstWord listener;
    FirstWord::Word word;
    {
        const engine::Client client(listener);
        word = listener.wait();
    }
    if (!word.problem.empty()) {
        std::cerr << "quorl: " << word.problem << '\n';
        return ExitCode::Failure;
    }
    const auto opened = preferences::SharedPreferences::open({});
    if (!opened.problem.empty()) {
        std::cerr << "quorl: " << opened.problem << '\n';
    }
    if (!opened.preferences) {
        return ExitCode::Failure;
    }
    const auto library = media::scan(options.places.music);
    const Choice choice = choiceOf(*opened.preferences, *library, isRunning(word.state));
    if (options.json) {
        std::cout << jsonOf(word.state, choice).dump(2, ' ', false, Json::error_handler_t::replace)
                  << '\n';
    } else {
        printText(word.state, choice);
    }
    return ExitCode::Success;
}

} // namespace quorl
