#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "quorl-syncd/engine/Situation.h"
#include "quorl-syncd/transfer/Outcome.h"
#include "services/engine/Message.h"

/// What the engine decides, from plain values.
namespace quorl::syncd {

/// What is to be done now.
struct Decision {
    enum class Kind {
        Rest,     ///< No sync is under way, and none is to begin.
        Begin,    ///< A sync of `selection` is to begin.
        Continue, ///< The sync that is under way goes on.
        Stop,     ///< It is to end, because of `message`.
    };

    Kind kind = Kind::Rest;
    wearable::Selection selection;
    engine::Message message;

    bool operator==(const Decision&) const = default;
};

[[nodiscard]] Decision decide(const Situation& situation);

/// Whether what the preferences say was sent is to be forgotten before the decision is carried out:
/// the wearable that is there does not have it, or a sync begins, which may change what it has.
[[nodiscard]] bool isClaimToBeForgotten(const Situation& situation, const Decision& decision);

/// What stands in the way of a sync; nothing where nothing does.
[[nodiscard]] std::optional<engine::Message> obstacleIn(const Situation& situation);

/// What the engine does, or what it waits for.
/// @param last what became of the last sync.
[[nodiscard]] engine::Message statusOf(const Situation& situation, const engine::Message& last);

/// How far the chosen playlist has come: the value of the engine's property SyncState.
[[nodiscard]] std::string_view syncStateOf(const Situation& situation);

/// What follows from the end of a sync.
struct Conclusion {
    bool success = false;
    engine::Message message;
    /// Its selection is not tried again until something changes.
    bool isGivenUp = false;
    /// It is tried again after some time all the same.
    bool isTriedAgain = false;

    bool operator==(const Conclusion&) const = default;
};

/// @param rememberProblem why it could not be remembered that all was sent; empty where it was, or
/// where there was nothing to remember.
/// @param whyStopped nothing where nobody has stopped the sync.
[[nodiscard]] Conclusion conclusionOf(const Outcome& outcome, const std::string& rememberProblem,
                                      const std::optional<engine::Message>& whyStopped);

} // namespace quorl::syncd
