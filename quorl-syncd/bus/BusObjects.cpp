#include "quorl-syncd/bus/BusObjects.h"

#include <exception>

#include <Engine-adaptor.h>
#include <Wearable-adaptor.h>

#include "quorl-syncd/bus/Published.h"
#include "quorl-syncd/bus/Watchers.h"
#include "quorl-syncd/engine/Engine.h"
#include "quorl-syncd/engine/NotReady.h"

namespace quorl::syncd {

namespace {

/// Has the caller on the bus told what went wrong, in words.
template <class Act>
void answering(const char* errorName, Act act) {
    try {
        act();
    } catch (const sdbus::Error&) {
        throw;
    } catch (const std::exception& problem) {
        throw sdbus::Error{errorName, problem.what()};
    }
}

/// Throws `NotReady` where the directory cannot be taken, or not be remembered; then all is as it
/// was.
template <class Take>
void choose(const std::string& directory, const std::string& before, Take take,
            const BusObjects::Directory& check, const BusObjects::Directory& remember) {
    if (const auto objection = check(directory); !objection.empty()) {
        throw NotReady(objection);
    }
    take(directory);
    if (const auto problem = remember(directory); !problem.empty()) {
        take(before);
        throw NotReady(problem);
    }
}

} // namespace

class BusObjects::EngineObject final
    : public sdbus::AdaptorInterfaces<org::quorl::Velora::Sync::Engine_adaptor,
                                      sdbus::Properties_adaptor> {
  public:
    EngineObject(sdbus::IConnection& bus, Engine& engine, const PlaceKeeper& keeper,
                 Watchers& watchers)
        : AdaptorInterfaces{bus, engine::enginePath},
          engine_(engine),
          keeper_(keeper),
          watchers_(watchers),
          published_(engine.status()) {
        registerAdaptor();
    }

    ~EngineObject() { unregisterAdaptor(); }

    void publish() { published_.change(*this, engine_.status()); }

  private:
    void StartNow() override {
        answering(engine::notReadyError, [this] { engine_.startNow(); });
    }

    void Cancel() override { engine_.cancel(); }

    void Watch() override { watchers_.add(caller()); }

    void Unwatch() override { watchers_.remove(caller()); }

    [[nodiscard]] std::string caller() const {
        return getObject().getCurrentlyProcessedMessage()->getSender();
    }

    std::string MusicFolder() override { return engine::valueOf<"MusicFolder">(*published_); }

    void MusicFolder(const std::string& path) override {
        answering(engine::notReadyError, [&] {
            choose(
                path, engine_.status().musicFolder,
                [this](const std::string& folder) { engine_.setMusicFolder(folder); },
                keeper_.check, keeper_.rememberMusicFolder);
        });
    }

    std::uint64_t RateLimit() override { return engine::valueOf<"RateLimit">(*published_); }

    void RateLimit(const std::uint64_t& bytesPerSecond) override {
        engine_.setRateLimit(bytesPerSecond);
    }

    std::string Status() override { return engine::valueOf<"Status">(*published_); }

    std::string StatusCode() override { return engine::valueOf<"StatusCode">(*published_); }

    std::vector<std::string> StatusArguments() override {
        return engine::valueOf<"StatusArguments">(*published_);
    }

    std::string SyncState() override { return engine::valueOf<"SyncState">(*published_); }

    std::string PlaylistName() override { return engine::valueOf<"PlaylistName">(*published_); }

    std::uint64_t PlaylistID() override { return engine::valueOf<"PlaylistID">(*published_); }

    std::uint64_t LimitType() override { return engine::valueOf<"LimitType">(*published_); }

    std::uint64_t Limit() override { return engine::valueOf<"Limit">(*published_); }

    bool LastSuccess() override { return engine::valueOf<"LastSuccess">(*published_); }

    std::string LastMessage() override { return engine::valueOf<"LastMessage">(*published_); }

    std::string LastCode() override { return engine::valueOf<"LastCode">(*published_); }

    std::vector<std::string> LastArguments() override {
        return engine::valueOf<"LastArguments">(*published_);
    }

    std::uint64_t LastTime() override { return engine::valueOf<"LastTime">(*published_); }

    std::uint64_t LastComplete() override { return engine::valueOf<"LastComplete">(*published_); }

    std::vector<engine::LeftOutItem> LeftOut() override {
        return engine::valueOf<"LeftOut">(*published_);
    }

    std::uint64_t LeftOutCount() override { return engine::valueOf<"LeftOutCount">(*published_); }

    std::uint64_t BeyondLimit() override { return engine::valueOf<"BeyondLimit">(*published_); }

    Engine& engine_;
    const PlaceKeeper& keeper_;
    Watchers& watchers_;
    Published<engine::EngineStatus> published_;
};

class BusObjects::WearableObject final
    : public sdbus::AdaptorInterfaces<org::quorl::Velora::Sync::Wearable_adaptor,
                                      sdbus::Properties_adaptor> {
  public:
    WearableObject(sdbus::IConnection& bus, Engine& engine, const PlaceKeeper& keeper)
        : AdaptorInterfaces{bus, engine::wearablePath},
          engine_(engine),
          keeper_(keeper),
          published_(engine.wearable()) {
        registerAdaptor();
    }

    ~WearableObject() { unregisterAdaptor(); }

    void publish() { published_.change(*this, engine_.wearable()); }

  private:
    std::string Directory() override { return engine::valueOf<"Directory">(*published_); }

    void Directory(const std::string& path) override {
        answering(engine::notReadyError, [&] {
            const auto before = engine_.wearable();
            choose(
                path, before.isEmbedded ? "" : before.directory,
                [this](const std::string& root) { engine_.setWearableDirectory(root); },
                keeper_.check, keeper_.rememberWearable);
        });
    }

    std::string Name() override { return engine::valueOf<"Name">(*published_); }

    bool Embedded() override { return engine::valueOf<"Embedded">(*published_); }

    bool Connected() override { return engine::valueOf<"Connected">(*published_); }

    void Connected(const bool& connected) override {
        answering(engine::readOnlyError,
                  [&] { engine_.attach({.connected = connected, .onCharger = {}}); });
    }

    bool OnCharger() override { return engine::valueOf<"OnCharger">(*published_); }

    void OnCharger(const bool& onCharger) override {
        answering(engine::readOnlyError,
                  [&] { engine_.attach({.connected = {}, .onCharger = onCharger}); });
    }

    std::uint64_t Capacity() override { return engine::valueOf<"Capacity">(*published_); }

    std::uint64_t Available() override { return engine::valueOf<"Available">(*published_); }

    std::uint64_t Songs() override { return engine::valueOf<"Songs">(*published_); }

    std::uint64_t SongCount() override { return engine::valueOf<"SongCount">(*published_); }

    void Refresh() override { engine_.refreshWearable(); }

    void RemoveMusic() override {
        answering(engine::notReadyError, [this] { engine_.removeMusic(); });
    }

    Engine& engine_;
    const PlaceKeeper& keeper_;
    Published<engine::WearableStatus> published_;
};

BusObjects::BusObjects(sdbus::IConnection& bus, Engine& engine, const PlaceKeeper& keeper,
                       Watchers& watchers)
    : engine_(std::make_unique<EngineObject>(bus, engine, keeper, watchers)),
      wearable_(std::make_unique<WearableObject>(bus, engine, keeper)) {
    bus.addObjectManager(engine::managerPath, sdbus::floating_slot);
}

BusObjects::~BusObjects() = default;

void BusObjects::publish() {
    engine_->publish();
    wearable_->publish();
}

} // namespace quorl::syncd
