#pragma once

#include <condition_variable>
#include <functional>
#include <future>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include "services/engine/Client.h"

namespace quorl::syncd::testing {

/// Something that a client was told.
struct Event {
    using Kind = engine::Event::Kind;

    Kind kind;
    /// What is known since; not null.
    std::shared_ptr<const engine::EngineState> state;
    engine::SessionState session = {};
    engine::TaskState task = {};
    bool success = false;
    std::string message = {};
};

/// A client of the engine that remembers all that it is told, and lets a test wait for it.
class Recorder {
  public:
    explicit Recorder(const std::string& name = engine::busName);

    [[nodiscard]] engine::Client& client() { return *client_; }

    /// What is known since the last event.
    [[nodiscard]] engine::EngineState state();

    /// Called on the client's thread with each event from now on.
    void onEvent(std::function<void(const Event&)> act);

    /// Waits for the next event of the kind, and passes over what was told before it.
    Event next(Event::Kind kind);

    /// The same for an event that `isWanted`.
    Event next(const std::function<bool(const Event&)>& isWanted);

    /// Waits until the engine's status is as given.
    void awaitStatus(const std::string& status);

    /// Waits until the state is as it is wanted.
    void awaitState(const std::function<bool(const engine::EngineState&)>& isWanted);

    /// All that was told so far.
    [[nodiscard]] std::vector<Event> all();

    /// Events of the kind so far.
    [[nodiscard]] std::size_t count(Event::Kind kind);

    /// Calls a method of the client and waits for its reply.
    template <class Method, class... Argument>
    std::string ask(Method method, const Argument&... arguments) {
        std::promise<std::string> reply;
        std::invoke(method, *client_, arguments...,
                    [&](const std::string& problem) { reply.set_value(problem); });
        return reply.get_future().get();
    }

  private:
    void note(const engine::Event& event);

    std::mutex mutex_;
    std::condition_variable more_;
    std::vector<Event> events_;
    std::shared_ptr<const engine::EngineState> state_ = std::make_shared<engine::EngineState>();
    std::size_t read_ = 0;
    std::function<void(const Event&)> act_;

    std::unique_ptr<engine::Client> client_;
};

} // namespace quorl::syncd::testing
