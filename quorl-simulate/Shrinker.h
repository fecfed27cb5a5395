#pragma once

#include <functional>

#include "quorl-simulate/Life.h"

namespace quorl::simulation {

/// The life with as few of its events as still break it, each with as short a wait as it can have.
[[nodiscard]] Life shrunk(Life life, const std::function<bool(const Life&)>& isBroken);

} // namespace quorl::simulation
