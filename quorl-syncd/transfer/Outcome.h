#pragma once

#include <vector>

#include "services/engine/Message.h"

namespace quorl::syncd {

/// What became of a sync.
struct Outcome {
    enum class Kind {
        Sent,    ///< Everything that was wished for is on the wearable, also after a loss of power.
        Failed,  ///< Not everything; what was there before is still there.
        Stopped, ///< As `Failed`, because it was asked to.
    };

    Kind kind = Kind::Failed;
    engine::Message message;
    /// The music folder is no longer as the order has it.
    bool isLibraryStale = false;
    /// What was in the way may go away by itself.
    bool mayPass = false;
    /// Of each song that could not be sent. The first argument is its path.
    std::vector<engine::Message> songProblems = {};

    bool operator==(const Outcome&) const = default;
};

} // namespace quorl::syncd
