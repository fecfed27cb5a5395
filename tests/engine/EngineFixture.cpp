#include "tests/engine/EngineFixture.h"

#include "services/media/MusicFolder.h"

namespace quorl::syncd::testing {

EngineTest::EngineTest()
    : wearable_{std::filesystem::path{std::getenv("XDG_DATA_HOME")} / "quorl/wearable"} {
    auto opened = preferences::SharedPreferences::open({});
    if (!opened.problem.empty()) {
        throw std::runtime_error{opened.problem};
    }
    preferences_ = std::move(opened.preferences);
}

void EngineTest::start(const std::vector<std::string>& options) {
    std::vector<std::string> command{ENGINE_PROGRAM, "--music-folder", music_.path()};
    command.insert(command.end(), options.begin(), options.end());
    engine_ = std::make_unique<Process>(command);
    recorder_.next(Event::Kind::EngineDidAppear);
}

int EngineTest::end(int signal) {
    engine_->signal(signal);
    const auto code = engine_->wait();
    recorder_.next(Event::Kind::EngineDidVanish);
    return code;
}

void EngineTest::choose(const std::string& title) {
    set(preferences::assetSyncEnabled, true);
    set(preferences::assetSyncPlaylistPersistentID, idOf(title));
}

void EngineTest::limitTo(std::uint64_t amount, std::uint64_t type) {
    set(preferences::assetSyncLimit, amount);
    set(preferences::assetSyncLimitType, type);
}

std::uint64_t EngineTest::idOf(const std::string& title) const {
    return wishFor(music_, Player{}, 0, 0, title).selection.playlist;
}

std::uint64_t EngineTest::revisionOf(const std::string& title) const {
    return wishFor(music_, Player{}, 0, 0, title).selection.revision;
}

Event EngineTest::nextOfAssets(Event::Kind kind) {
    return recorder_.next([kind](const Event& event) {
        return event.kind == kind && event.task.groupingKey == engine::assetGroupingKey;
    });
}

void EngineTest::listLargeSongs() {
    for (const auto* name : {"1.mp3", "2.mp3", "3.mp3"}) {
        music_.write(name, std::string(1'000'000, name[0]));
    }
    music_.list({"1.mp3", "2.mp3", "3.mp3"});
}

} // namespace quorl::syncd::testing
