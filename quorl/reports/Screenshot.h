#pragma once

#include "quorl/app/Picture.h"
#include "quorl/app/Places.h"
#include "quorl/process/ExitCode.h"

namespace quorl {

/// Writes a picture of a window once it shows what is there: the music folder has been read, the
/// wearable has answered, what that led to has been done, and the pane that is wanted is open.
/// `program` is how this program was called.
[[nodiscard]] ExitCode takeScreenshot(char* program, const Places& places, const Picture& picture);

} // namespace quorl
