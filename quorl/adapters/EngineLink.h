#pragma once

#include <filesystem>
#include <functional>

#include "quorl/adapters/EngineSession.h"
#include "services/engine/Client.h"

namespace quorl {

/// The sync engine as panes see it: its sessions, and what it tells about itself and the wearable.
/// What the engine's client says on its own thread is brought to the main thread, on which
/// observers of sessions are told too. Main thread.
class EngineLink final {
  public:
    /// Called whenever `state` has changed, with what has happened.
    using Changed = std::function<void(const engine::Event&)>;

    /// Something that the engine's client is asked for.
    using Request = void (engine::Client::*)(engine::Client::Reply);

    /// Is called with an empty text, or with a sentence that says why something was not done.
    using Done = std::function<void(const std::string& problem)>;

    /// Connects in the background and starts the engine where it does not run; not that of a trial,
    /// which is started with the trial. Where there is
    /// nothing to connect to there are no sessions, which is no error.
    EngineLink(base::Purpose purpose, Changed changed);

    EngineLink(const EngineLink&) = delete;
    EngineLink& operator=(const EngineLink&) = delete;

    /// The sessions of a type that exist now, never null.
    [[nodiscard]] NSArray<DVSession> sessions(const std::string& type) const;

    [[nodiscard]] const engine::EngineState& state() const { return *state_; }

    /// `done` is called once, unless the link is gone by then.
    void ask(Request request, Done done);

    /// The same; an empty directory stands for the embedded wearable.
    void chooseWearable(const std::filesystem::path& directory, Done done);

    void setConnected(bool connected) { client_.setConnected(connected); }

    void setOnCharger(bool onCharger) { client_.setOnCharger(onCharger); }

    /// Whether a person sees how the engine does. `done` is called once that was told.
    void setWatching(bool isWatching, Done done);

  private:
    struct Inbox;

    [[nodiscard]] engine::Client::Reply onMainQueue(Done done) const;
    void fetch();
    void take(const engine::Event& event);
    void tellObservers(const engine::Event& event) const;

    const Changed changed_;
    std::shared_ptr<const engine::EngineState> state_ = std::make_shared<engine::EngineState>();
    std::vector<std::shared_ptr<EngineSession>> sessions_;
    std::shared_ptr<Inbox> inbox_;
    engine::Client client_; ///< last: its thread fills the inbox until it is destroyed
};

} // namespace quorl
