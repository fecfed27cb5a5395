#pragma once

#include <filesystem>
#include <functional>

#include "quorl/adapters/EngineSession.h"
#include "services/engine/Client.h"

namespace quorl {

/// The sync engine as panes see it: its sessions, and what it tells about itself and the wearable.
/// Main thread, except for the listener's part, which the engine's client calls on its own thread.
/// Observers of sessions are told on that thread too.
class EngineLink final : public engine::Listener {
  public:
    /// Called on the main thread whenever `state` may have changed, and with a sentence for the
    /// user when the session bus is gone; that sentence is empty otherwise.
    using Changed = std::function<void(const std::string& problem)>;

    /// What the engine is to work with while this app is there.
    struct Places {
        std::filesystem::path music;    ///< absolute
        std::filesystem::path wearable; ///< absolute; empty for the embedded one
    };

    /// Connects in the background and starts the engine where it does not run. Where there is
    /// nothing to connect to there are no sessions, which is no error.
    EngineLink(Places places, Changed changed);

    EngineLink(const EngineLink&) = delete;
    EngineLink& operator=(const EngineLink&) = delete;

    /// The sessions of a type that exist now, never null.
    [[nodiscard]] NSArray<DVSession> sessions(const std::string& type) const;

    [[nodiscard]] engine::EngineState state() const { return client_.state(); }

    void setConnected(bool connected) { client_.setConnected(connected); }

    void setOnCharger(bool onCharger) { client_.setOnCharger(onCharger); }

    void engineDidAppear(const engine::EngineState& state) override;
    void engineDidVanish(const std::string& reason) override;
    void busDidVanish(const std::string& problem) override;
    void sessionWillBegin(const engine::SessionState& session) override;
    void taskWillBegin(const engine::SessionState& session, const engine::TaskState& task) override;
    void taskDidBegin(const engine::SessionState& session, const engine::TaskState& task) override;
    void taskDidUpdate(const engine::SessionState& session, const engine::TaskState& task) override;
    void taskDidFinish(const engine::SessionState& session, const engine::TaskState& task,
                       bool success, const std::string& message) override;
    void sessionDidFinish(const engine::SessionState& session, bool success,
                          const std::string& message) override;
    void sessionDidVanish(const engine::SessionState& session) override;
    void statusDidChange() override;

  private:
    struct Shared;
    using TaskMessage = void (DVSessionObserver::*)(DVSession&, DVSessionTask&);

    void tellPlaces();
    void tellTask(const engine::SessionState& session, const engine::TaskState& task,
                  TaskMessage message);
    void replaceSessions(const std::vector<engine::SessionState>& sessions);

    const Places places_;
    std::shared_ptr<Shared> shared_;
    engine::Client client_; ///< last: its thread calls this object until it is destroyed
};

} // namespace quorl
