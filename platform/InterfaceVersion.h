#pragma once

/// The version of the declarations in this folder. A plug-in's registration names the version that
/// it was built against; a host loads only plug-ins of its own version. It goes up with every
/// change of a declaration here that changes the binary interface.
inline constexpr int QuorlInterfaceVersion = 3;
