#include "tests/engine/Recorder.h"

#include <algorithm>

namespace quorl::syncd::testing {

Recorder::Recorder(const std::string& name) : client_{new engine::Client{*this, name}} {}

void Recorder::onEvent(std::function<void(const Event&)> act) {
    const std::scoped_lock lock{mutex_};
    act_ = std::move(act);
}

void Recorder::note(Event event) {
    std::function<void(const Event&)> act;
    {
        const std::scoped_lock lock{mutex_};
        act = act_;
    }
    if (act) {
        act(event);
    }
    const std::scoped_lock lock{mutex_};
    events_.push_back(std::move(event));
    more_.notify_all();
}

Event Recorder::next(Event::Kind kind) {
    return next([kind](const Event& event) { return event.kind == kind; });
}

Event Recorder::next(const std::function<bool(const Event&)>& isWanted) {
    std::unique_lock lock{mutex_};
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
    std::unique_lock lock{mutex_};
    for (;;) {
        // Each change of the state is followed by an event; one that comes while the state is
        // looked at has it looked at again.
        const auto seen = events_.size();
        lock.unlock();
        const bool is = isWanted(client_->state());
        lock.lock();
        if (is) {
            return;
        }
        more_.wait(lock, [&] { return events_.size() > seen; });
    }
}

std::vector<Event> Recorder::all() {
    const std::scoped_lock lock{mutex_};
    return events_;
}

std::size_t Recorder::count(Event::Kind kind) {
    const std::scoped_lock lock{mutex_};
    return static_cast<std::size_t>(std::ranges::count(events_, kind, &Event::kind));
}

} // namespace quorl::syncd::testing
