#pragma once

#include <string>

namespace quorl::syncd {

/// What became of a sync.
struct Outcome {
    enum class Kind {
        Sent,    ///< Everything that was wished for is on the wearable, also after a loss of power.
        Failed,  ///< Not everything; what was there before is still there.
        Stopped, ///< As `Failed`, because it was asked to.
    };

    Kind kind = Kind::Failed;
    /// For the user, in a sentence or several.
    std::string message;
    /// The music folder is no longer as the order has it.
    bool isLibraryStale = false;
    /// What was in the way may go away by itself.
    bool mayPass = false;

    bool operator==(const Outcome&) const = default;
};

} // namespace quorl::syncd
