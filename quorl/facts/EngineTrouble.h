#pragma once

#include <optional>
#include <string>

#include "quorl/adapters/EngineLink.h"

namespace quorl {

/// What can be done about a trouble, in the app.
enum class Remedy { LookAgain, TryAgain, StartEngine };

/// What a button that does it is called.
[[nodiscard]] std::string nameOf(Remedy remedy);

/// What the engine is asked for then.
[[nodiscard]] EngineLink::Request requestOf(Remedy remedy);

/// What keeps music from being synced and does not go away by itself.
struct EngineTrouble {
    std::string sentence; ///< what is the matter and what to do
    Remedy remedy = Remedy::TryAgain;

    [[nodiscard]] bool operator==(const EngineTrouble&) const = default;
};

/// Nothing where all is as it should be, where the person has it so, or where one only has to wait.
[[nodiscard]] std::optional<EngineTrouble> troubleIn(const engine::EngineState& state);

} // namespace quorl
