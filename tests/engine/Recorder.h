#pragma once

#include <condition_variable>
#include <functional>
#include <future>
#include <mutex>
#include <string>
#include <vector>

#include "services/engine/Client.h"

namespace quorl::syncd::testing {

/// Something that a client was told.
struct Event {
    enum class Kind {
        EngineDidAppear,
        EngineDidVanish,
        BusDidVanish,
        SessionWillBegin,
        TaskWillBegin,
        TaskDidBegin,
        TaskDidUpdate,
        TaskDidFinish,
        SessionDidFinish,
        SessionDidVanish,
        StatusDidChange
    };

    Kind kind;
    engine::SessionState session = {};
    engine::TaskState task = {};
    bool success = false;
    std::string message = {};
};

/// A client of the engine that remembers all that it is told, and lets a test wait for it.
class Recorder : private engine::Listener {
  public:
    explicit Recorder(const std::string& name = engine::busName);

    [[nodiscard]] engine::Client& client() { return *client_; }

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
    using Kind = Event::Kind;

    void note(Event event);

    void engineDidAppear(const engine::EngineState& /*state*/) override {
        note({Kind::EngineDidAppear});
    }

    void engineDidVanish(const std::string& reason) override {
        note({Kind::EngineDidVanish, {}, {}, false, reason});
    }

    void busDidVanish(const std::string& problem) override {
        note({Kind::BusDidVanish, {}, {}, false, problem});
    }

    void sessionWillBegin(const engine::SessionState& session) override {
        note({Kind::SessionWillBegin, session});
    }

    void taskWillBegin(const engine::SessionState& session,
                       const engine::TaskState& task) override {
        note({Kind::TaskWillBegin, session, task});
    }

    void taskDidBegin(const engine::SessionState& session, const engine::TaskState& task) override {
        note({Kind::TaskDidBegin, session, task});
    }

    void taskDidUpdate(const engine::SessionState& session,
                       const engine::TaskState& task) override {
        note({Kind::TaskDidUpdate, session, task});
    }

    void taskDidFinish(const engine::SessionState& session, const engine::TaskState& task,
                       bool success, const std::string& message) override {
        note({Kind::TaskDidFinish, session, task, success, message});
    }

    void sessionDidFinish(const engine::SessionState& session, bool success,
                          const std::string& message) override {
        note({Kind::SessionDidFinish, session, {}, success, message});
    }

    void sessionDidVanish(const engine::SessionState& session) override {
        note({Kind::SessionDidVanish, session});
    }

    void statusDidChange() override { note({Kind::StatusDidChange}); }

    std::mutex mutex_;
    std::condition_variable more_;
    std::vector<Event> events_;
    std::size_t read_ = 0;
    std::function<void(const Event&)> act_;

    std::unique_ptr<engine::Client> client_;
};

} // namespace quorl::syncd::testing
