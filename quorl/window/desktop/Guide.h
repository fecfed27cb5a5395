#pragma once

namespace quorl {

/// Opens the app's manual page in whatever this desktop reads manuals with. False where either of
/// them is not installed, or the reader does not start. Main thread.
[[nodiscard]] bool openGuide();

} // namespace quorl
