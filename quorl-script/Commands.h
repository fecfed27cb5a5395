#pragma once

#include "doubles/HostDouble.h"
#include "quorl-script/Panes.h"
#include "quorl-script/Plugin.h"
#include "quorl-script/input/Field.h"

namespace quorl {

/// What commands work on.
struct Stage {
    HostDouble& host;
    std::shared_ptr<Trace> trace;
    const Plugin& plugin;
    Panes panes;
};

/// Carries a command out and gives back what its reply has besides the trace. Everything of the
/// command is checked first: where it is not right a `CommandError` is thrown and nothing has
/// changed.
using Command = JsonObject (*)(Stage& stage, const Field& command);

/// The command of this name, or null: of those that set the situation, and of those that are a
/// user's or the host's doing. `batch` is neither.
[[nodiscard]] Command situationCommand(std::string_view name);
[[nodiscard]] Command paneCommand(std::string_view name);

/// One of the latter, which has its own file.
[[nodiscard]] JsonObject send(Stage& stage, const Field& command);

} // namespace quorl
