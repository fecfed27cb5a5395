#include "quorl/window/desktop/Start.h"

#include <QtGlobal>

namespace quorl {

Start Start::with(const Places& places) {
    const QByteArray token = qgetenv("XDG_ACTIVATION_TOKEN");
    return {places, token.isEmpty() ? qgetenv("DESKTOP_STARTUP_ID") : token};
}

} // namespace quorl
