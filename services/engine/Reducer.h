#pragma once

#include <optional>

#include "services/engine/BusMessage.h"
#include "services/engine/Event.h"

namespace quorl::engine {

struct Reduced {
    /// Not null.
    std::shared_ptr<const EngineState> state;
    /// What is to be told of it; always with this state.
    std::optional<Event> event = {};
};

/// What is known of an engine after a message, and what happened by it. A message that makes no
/// sense after what came before, or that is about something unknown, changes nothing and tells
/// nothing: any program may offer the interfaces.
/// @param state not null
[[nodiscard]] Reduced reduce(const std::shared_ptr<const EngineState>& state,
                             const BusMessage& message);

} // namespace quorl::engine
