#pragma once

#include <memory>
#include <string>

#include "services/engine/EngineState.h"

namespace quorl::engine {

/// Something that happened to the engine, and what is known of it since.
struct Event {
    enum class Kind {
        /// The engine is there, with all that `state` has. Comes again whenever it was restarted.
        /// Sessions that are running then are not told one by one.
        EngineDidAppear,
        /// There is no engine, or none any more; no sessions either. That is no error: one may
        /// come. The message says why.
        EngineDidVanish,
        /// The same, for there is no session bus any more, and nothing comes after this. The
        /// message says what to do.
        BusDidVanish,
        SessionWillBegin,
        TaskWillBegin,
        TaskDidBegin,
        TaskDidUpdate,
        /// Has a message, as the next.
        TaskDidFinish,
        SessionDidFinish,
        /// The session, as it last was, is no longer in `state`.
        SessionDidVanish,
        /// The engine's own status or that of the wearable is another one.
        StatusDidChange,
    };

    Kind kind;
    /// Not null.
    std::shared_ptr<const EngineState> state;
    /// What it happened to; null where it happened to no session, or to no task.
    std::shared_ptr<const SessionState> session = {};
    std::shared_ptr<const TaskState> task = {};
    bool success = false;
    /// A sentence for the user.
    std::string message = {};
};

} // namespace quorl::engine
