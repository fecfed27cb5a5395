#include "tests/engine/Recorder.h"

#include <algorithm>

namespace quorl::syncd::testing {

namespace {

/// The event as it was, whatever happens afterwards.
Event copyOf(const engine::Event& event) {
    return {.kind = event.kind,
            .state = event.state,
            .session = event.session ? *event.session : engine::SessionState(),
            .task = event.task ? *event.task : engine::TaskState(),
            .success = event.success,
            .message = event.message};
}

} // namespace

Recorder::Recorder(const std::string& name)
    : client_(std::make_unique<engine::Client>([this](const engine::Event& event) { note(event); },
                                               name)) {}

engine::EngineState Recorder::state() {
    const std::scoped_lock lock(mutex_);
    return *state_;
}

void Recorder::onEvent(std::function<void(const Event&)> act) {
    const std::scoped_lock lock(mutex_);
    act_ = std::move(act);
}

void Recorder::note(const engine::Event& told) {
    const auto event = copyOf(told);
    std::function<void(const Event&)> act;
    {
        const std::scoped_lock lock(mutex_);
        act = act_;
    }
    if (act) {
        act(event);
    }
    const std::scoped_lock lock(mutex_);
    events_.push_back(event);
    state_ = told.state;
    more_.notify_all();
}

Event Recorder::next(Event::Kind kind) {
    return next([kind](const Event& event) { return event.kind == kind; });
}

Event Recorder::next(const std::function<bool(const Event&)>& isWanted) {
    std::unique_lock lock(mutex_);
    for (;;) {
        more_.wait(lock, [this] { return read_ < events_.size(); });
        const auto& event = events_[read_++];
        if (isWanted(event)) {
            return event;
        }
    }
}

void Recorder::awaitStatus(const std::string& status) {
    awaitState([&](const engine::EngineState& state) { return state.engine.status == status; });
}

void Recorder::awaitState(const std::function<bool(const engine::EngineState&)>& isWanted) {
    std::unique_lock lock(mutex_);
    more_.wait(lock, [&] { return isWanted(*state_); });
}

std::vector<Event> Recorder::all() {
    const std::scoped_lock lock(mutex_);
    return events_;
}

std::size_t Recorder::count(Event::Kind kind) {
    const std::scoped_lock lock(mutex_);
    return static_cast<std::size_t>(std::ranges::count(events_, kind, &Event::kind));
}

} // namespace quorl::syncd::testing
