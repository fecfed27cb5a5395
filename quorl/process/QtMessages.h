#pragma once

namespace quorl {

/// Has what Qt says on standard error go on as it does, but for its last words: where it is about
/// to end the process for want of a display, that is told as everything else of this program is,
/// and the process ends with `ExitCode::Failure` rather than by a signal. Main thread.
void takeQtMessages();

} // namespace quorl
