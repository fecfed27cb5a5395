#include "quorl-syncd/bus/BusObjects.h"

#include <exception>

#include <Engine-adaptor.h>
#include <Wearable-adaptor.h>

#include "quorl-syncd/engine/Engine.h"
#include "services/engine/Names.h"

namespace quorl::syncd {

namespace {

/// The names of the properties whose values differ. `fields` pairs names with member pointers.
template <class Status, class... Field>
std::vector<std::string> changes(const Status& before, const Status& now,
                                 const std::pair<const char*, Field>&... fields) {
    std::vector<std::string> names;
    const auto compare = [&](const auto& field) {
        if (before.*field.second != now.*field.second) {
            names.emplace_back(field.first);
        }
    };
    (compare(fields), ...);
    return names;
}

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

} // namespace

class BusObjects::EngineObject final
    : public sdbus::AdaptorInterfaces<org::quorl::Velora::Sync::Engine_adaptor,
                                      sdbus::Properties_adaptor> {
  public:
    EngineObject(sdbus::IConnection& bus, Engine& engine)
        : AdaptorInterfaces{bus, engine::enginePath}, engine_{engine}, published_{engine.status()} {
        registerAdaptor();
    }

    ~EngineObject() { unregisterAdaptor(); }

    void publish() {
        using Status = engine::EngineStatus;
        const auto now = engine_.status();
        const auto names = changes(published_, now, std::pair{"MusicFolder", &Status::musicFolder},
                                   std::pair{"RateLimit", &Status::rateLimit},
                                   std::pair{"Status", &Status::status},
                                   std::pair{"LastSuccess", &Status::lastSuccess},
                                   std::pair{"LastMessage", &Status::lastMessage},
                                   std::pair{"LastTime", &Status::lastTime});
        published_ = now;
        if (!names.empty()) {
            emitPropertiesChangedSignal(engine::engineInterface, names);
        }
    }

  private:
    void StartNow() override {
        answering(engine::notReadyError, [this] { engine_.startNow(); });
    }

    void Cancel() override { engine_.cancel(); }

    std::string MusicFolder() override { return engine_.status().musicFolder; }

    void MusicFolder(const std::string& path) override {
        answering(engine::notReadyError, [&] { engine_.setMusicFolder(path); });
    }

    std::uint64_t RateLimit() override { return engine_.status().rateLimit; }

    void RateLimit(const std::uint64_t& bytesPerSecond) override {
        engine_.setRateLimit(bytesPerSecond);
    }

    std::string Status() override { return engine_.status().status; }

    bool LastSuccess() override { return engine_.status().lastSuccess; }

    std::string LastMessage() override { return engine_.status().lastMessage; }

    std::uint64_t LastTime() override { return engine_.status().lastTime; }

    Engine& engine_;
    engine::EngineStatus published_;
};

class BusObjects::WearableObject final
    : public sdbus::AdaptorInterfaces<org::quorl::Velora::Sync::Wearable_adaptor,
                                      sdbus::Properties_adaptor> {
  public:
    WearableObject(sdbus::IConnection& bus, Engine& engine)
        : AdaptorInterfaces{bus, engine::wearablePath},
          engine_{engine},
          published_{engine.wearable()} {
        registerAdaptor();
    }

    ~WearableObject() { unregisterAdaptor(); }

    void publish() {
        using Status = engine::WearableStatus;
        const auto now = engine_.wearable();
        const auto names = changes(
            published_, now, std::pair{"Directory", &Status::directory},
            std::pair{"Embedded", &Status::isEmbedded},
            std::pair{"Connected", &Status::isConnected},
            std::pair{"OnCharger", &Status::isOnCharger}, std::pair{"Capacity", &Status::capacity},
            std::pair{"Available", &Status::available}, std::pair{"Songs", &Status::songs});
        published_ = now;
        if (!names.empty()) {
            emitPropertiesChangedSignal(engine::wearableInterface, names);
        }
    }

  private:
    std::string Directory() override { return engine_.wearable().directory; }

    void Directory(const std::string& path) override {
        answering(engine::notReadyError, [&] { engine_.setWearableDirectory(path); });
    }

    std::string Name() override { return engine_.wearable().name; }

    bool Embedded() override { return engine_.wearable().isEmbedded; }

    bool Connected() override { return engine_.wearable().isConnected; }

    void Connected(const bool& connected) override {
        answering(engine::readOnlyError, [&] {
            engine_.attach({connected, engine_.attachment().onCharger});
        });
    }

    bool OnCharger() override { return engine_.wearable().isOnCharger; }

    void OnCharger(const bool& onCharger) override {
        answering(engine::readOnlyError, [&] {
            engine_.attach({engine_.attachment().connected, onCharger});
        });
    }

    std::uint64_t Capacity() override { return engine_.wearable().capacity; }

    std::uint64_t Available() override { return engine_.wearable().available; }

    std::uint64_t Songs() override { return engine_.wearable().songs; }

    void Refresh() override { engine_.refreshWearable(); }

    Engine& engine_;
    engine::WearableStatus published_;
};

BusObjects::BusObjects(sdbus::IConnection& bus, Engine& engine)
    : engine_{std::make_unique<EngineObject>(bus, engine)},
      wearable_{std::make_unique<WearableObject>(bus, engine)} {
    bus.addObjectManager(engine::managerPath, sdbus::floating_slot);
}

BusObjects::~BusObjects() = default;

void BusObjects::publish() {
    engine_->publish();
    wearable_->publish();
}

} // namespace quorl::syncd
