#include "quorl/window/desktop/Licences.h"

#include <array>

namespace quorl {

std::span<const Licence> licences() {
    static constexpr std::array all{
        Licence{"CLI11", "BSD-3-Clause"},         Licence{"dconf", "LGPL-2.1-or-later"},
        Licence{"elfutils", "LGPL-3.0-or-later"}, Licence{"gettext", "LGPL-2.1-or-later"},
        Licence{"GLib", "LGPL-2.1-or-later"},     Licence{"ICU", "Unicode-DFS-2016"},
        Licence{"libdispatch", "Apache-2.0"},     Licence{"libsystemd", "LGPL-2.1-or-later"},
        Licence{"ncurses", "MIT-open-group"},     Licence{"nettle", "LGPL-3.0-or-later"},
        Licence{"nlohmann/json", "MIT"},          Licence{"pugixml", "MIT"},
        Licence{"Qt", "LGPL-3.0-only"},           Licence{"sdbus-c++", "LGPL-2.1-or-later"},
        Licence{"xxHash", "BSD-2-Clause"},
    };
    return all;
}

} // namespace quorl
