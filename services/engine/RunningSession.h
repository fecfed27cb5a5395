#pragma once

#include <algorithm>

#include "services/engine/EngineState.h"

namespace quorl::engine {

/// The session that is under way, the oldest of several; null where none is. Lives as long as
/// `state`.
[[nodiscard]] inline const SessionState* runningSession(const EngineState& state) {
    const auto found = std::ranges::find(state.sessions, false, &SessionState::isFinished);
    return found == state.sessions.end() ? nullptr : &*found;
}

} // namespace quorl::engine
