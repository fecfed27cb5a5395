#pragma once

/// The version of the declarations in this folder. A plug-in's registration names the version that
/// it was built against; a host loads a plug-in of its own version and of the same version with a
/// smaller minor number. The version goes up, and the minor number back to 0, with every change
/// that a plug-in which was built before could trip over; the minor number goes up with every other
/// change of the binary interface.
inline constexpr int QuorlInterfaceVersion = 3;
inline constexpr int QuorlInterfaceMinorVersion = 1;
