#pragma once

#include <string>

#include "services/engine/EngineState.h"

namespace quorl {

/// How long a session is likely to go on, for a person; empty where that is not known yet.
[[nodiscard]] std::string timeLeft(const engine::SessionState& session);

} // namespace quorl
