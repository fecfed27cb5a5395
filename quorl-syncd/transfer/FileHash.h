#pragma once

#include <stop_token>

#include "services/base/Reader.h"
#include "services/wearable/ContentHash.h"

namespace quorl::syncd {

using wearable::hashOf;

/// Of everything that is left to read. Throws `Stopped` soon after `stop` was requested.
[[nodiscard]] wearable::Digest hashOf(base::Reader& reader, const std::stop_token& stop);

} // namespace quorl::syncd
