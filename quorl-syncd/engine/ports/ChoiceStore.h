#pragma once

#include <string>

#include "quorl-syncd/engine/Choices.h"

namespace quorl::syncd {

/// The preferences that the app and the engine share.
class ChoiceStore {
  public:
    virtual ~ChoiceStore() = default;

    /// As they are at this moment. Not all of them need be of one moment: the app writes one after
    /// the other.
    [[nodiscard]] virtual Choices read() = 0;

    /// Writes what was last sent in full, first the playlist, then the revision, and returns once
    /// both outlive a loss of power. Gives back an empty text, or a sentence that says why it could
    /// not be done; then the playlist may have been written, the revision not.
    [[nodiscard]] virtual std::string rememberSent(const SentPlaylist& sent) = 0;

    /// Has nothing be sent, first the revision, then the playlist, and returns once that outlives a
    /// loss of power. Gives back an empty text, or a sentence that says why it could not be done;
    /// then one or both may still be there.
    [[nodiscard]] virtual std::string forgetSent() = 0;

    /// Has nothing be synced any more. Gives back an empty text, or a sentence that says why it
    /// could not be done; then all is as it was.
    [[nodiscard]] virtual std::string switchOff() = 0;
};

} // namespace quorl::syncd
