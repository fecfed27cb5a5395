#include "services/engine/PendingEvents.h"

#include <algorithm>
#include <utility>

namespace quorl::engine {

namespace {

/// Whether only the latest of several is of interest.
bool isUpdate(const Event& event) {
    return event.kind == Event::Kind::TaskDidUpdate || event.kind == Event::Kind::StatusDidChange;
}

std::string taskOf(const Event& event) { return event.task ? event.task->path : std::string(); }

} // namespace

void PendingEvents::add(Event event) {
    if (isUpdate(event)) {
        // Not beyond what happened in between.
        const auto begin = std::find_if_not(events_.rbegin(), events_.rend(), isUpdate).base();
        const auto isEarlier = [&](const Event& pending) {
            return pending.kind == event.kind && taskOf(pending) == taskOf(event);
        };
        events_.erase(std::remove_if(begin, events_.end(), isEarlier), events_.end());
    }
    events_.push_back(std::move(event));
}

std::vector<Event> PendingEvents::take() { return std::exchange(events_, {}); }

} // namespace quorl::engine
