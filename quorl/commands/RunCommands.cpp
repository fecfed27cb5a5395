#include "quorl/commands/RunCommands.h"

#include <iostream>

#include "quorl/commands/EngineWatch.h"
#include "quorl/commands/OfferedWearables.h"
#include "quorl/facts/OfferedPlaylists.h"
#include "services/media/MusicFolder.h"
#include "services/preferences/ChosenPlaces.h"

namespace quorl {

namespace {

using preferences::SharedPreferences;

/// Why something cannot be done, for the user; empty where it was.
using Problem = std::string;

Problem chooseNone(SharedPreferences& preferences) {
    return preferences.set(preferences::assetSyncEnabled, false).problem;
}

/// Writes as the pane does: the switch first.
Problem choose(SharedPreferences& preferences, const std::string& wanted) {
    if (wanted == "none") {
        return chooseNone(preferences);
    }
    const auto inventory = media::scan(preferences::chosenMusicFolder(preferences));
    const auto found = findOffered(*inventory, wanted);
    if (const auto* problem = std::get_if<std::string>(&found)) {
        return *problem;
    }
    const auto id = std::get<const media::Playlist*>(found)->id;
    const auto enabled = preferences.set(preferences::assetSyncEnabled, true);
    return enabled.problem.empty()
               ? preferences.set(preferences::assetSyncPlaylistPersistentID, id).problem
               : enabled.problem;
}

/// Writes as the pane does: the amount first.
Problem setLimit(SharedPreferences& preferences, const LimitChoice& limit) {
    const auto amount = preferences.set(preferences::assetSyncLimit, limit.amount);
    return amount.problem.empty()
               ? preferences.set(preferences::assetSyncLimitType, limit.type).problem
               : amount.problem;
}

Problem chooseAll(SharedPreferences& preferences, const Commands& commands) {
    const auto problem = commands.playlist ? choose(preferences, *commands.playlist) : Problem();
    return problem.empty() && commands.limit ? setLimit(preferences, *commands.limit) : problem;
}

/// Whether the engine goes by what is chosen now, and knows what became of it.
bool hasTaken(const engine::EngineState& state, const SharedPreferences& preferences) {
    const auto id = preferences.get(preferences::assetSyncPlaylistPersistentID).value_or(0);
    const bool isEnabled = preferences.get(preferences::assetSyncEnabled);
    const auto& engine = state.engine;
    return engine.playlistID == (isEnabled ? id : 0) &&
           engine.limitType == preferences.get(preferences::assetSyncLimitType) &&
           engine.limit == preferences.get(preferences::assetSyncLimit).value_or(0) &&
           engine.syncState != engine::syncUnknown;
}

enum class Sync { AsIsDue, Now };

/// Waits for everything to be on the wearable.
/// @param lastTime of the last session before.
Problem wait(EngineWatch& engine, const SharedPreferences& preferences, Sync sync,
             std::uint64_t lastTime) {
    const auto end = engine.waitUntil([&](const engine::EngineState& state) {
        const bool isOver = state.engine.lastTime != lastTime;
        const bool hasFailed = isOver && !state.engine.lastSuccess;
        const bool isSynced =
            state.engine.syncState == engine::syncSynced && (isOver || sync == Sync::AsIsDue);
        return hasTaken(state, preferences) &&
               (isSynced || hasFailed || state.engine.syncState == engine::syncOff);
    });
    if (const auto* problem = std::get_if<std::string>(&end)) {
        return *problem;
    }
    const auto& status = std::get<std::shared_ptr<const engine::EngineState>>(end)->engine;
    return status.syncState == engine::syncSynced ? ""
           : status.syncState == engine::syncOff  ? status.status
                                                  : status.lastMessage;
}

Problem instruct(SharedPreferences& preferences, const Commands& commands) {
    EngineWatch engine;
    const auto taken = engine.waitUntil(
        [&](const engine::EngineState& state) { return hasTaken(state, preferences); });
    if (const auto* problem = std::get_if<std::string>(&taken)) {
        return *problem;
    }
    const auto before =
        std::get<std::shared_ptr<const engine::EngineState>>(taken)->engine.lastTime;
    Problem problem;
    if (commands.cancel) {
        problem = engine.ask(&engine::Client::cancel);
    } else if (commands.sync) {
        problem = engine.ask(&engine::Client::startNow);
    }
    const auto sync = commands.sync ? Sync::Now : Sync::AsIsDue;
    return problem.empty() && commands.wait ? wait(engine, preferences, sync, before) : problem;
}

Problem useWearable(EngineWatch& engine, const std::string& wanted) {
    const auto found = findOffered(finding::findNow(finding::homeDirectory()), wanted);
    if (const auto* problem = std::get_if<std::string>(&found)) {
        return *problem;
    }
    return engine.tell(&engine::Client::setWearableDirectory,
                       std::get<std::filesystem::path>(found).string());
}

/// The engine takes a place before it writes it into the settings.
Problem usePlaces(const Commands& commands) {
    if (!commands.wearable && !commands.music) {
        return {};
    }
    EngineWatch engine;
    const auto there = engine.waitUntil([](const engine::EngineState& /*state*/) { return true; });
    if (const auto* problem = std::get_if<std::string>(&there)) {
        return *problem;
    }
    auto problem = commands.wearable ? useWearable(engine, *commands.wearable) : Problem();
    if (problem.empty() && commands.music) {
        problem = engine.tell(&engine::Client::setMusicFolder, *commands.music);
    }
    return problem;
}

Problem run(const Commands& commands) {
    if (auto problem = usePlaces(commands); !problem.empty()) {
        return problem;
    }
    const auto opened = SharedPreferences::open({});
    if (!opened.problem.empty()) {
        return opened.problem;
    }
    const auto problem = chooseAll(*opened.preferences, commands);
    const bool wantsEngine = commands.cancel || commands.sync || commands.wait;
    return problem.empty() && wantsEngine ? instruct(*opened.preferences, commands) : problem;
}

} // namespace

ExitCode runCommands(const Commands& commands) {
    const auto problem = run(commands);
    if (!problem.empty()) {
        std::cerr << "quorl: " << problem << '\n';
    }
    return problem.empty() ? ExitCode::Success : ExitCode::Failure;
}

} // namespace quorl
