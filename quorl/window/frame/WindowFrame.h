#pragma once

#include <QString>

#include "quorl/window/HeaderBar.h"

namespace quorl {

/// Whether the desktop leaves the frames of windows to the apps: their title bars are to be headers
/// with buttons, and there is to be no second one above.
/// @param platform as Qt names it.
/// @param desktops as in XDG_CURRENT_DESKTOP.
[[nodiscard]] bool isFrameLeftToApps(const QString& platform, const QString& desktops);

/// Has `window` do without a frame of the system's: the header moves it, and has the buttons that
/// the desktop wants; its edges change its size. Before the window is shown. `screen` outlives the
/// window. Main thread.
void frameByHeader(QWidget& window, HeaderBar& header, WindowScreen& screen);

} // namespace quorl
