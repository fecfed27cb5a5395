#pragma once

#include <optional>

#include "platform/Foundation.h"

namespace quorl {

/// The row that a key goes to from row `from` of rows 0 to `last`, of which `page` are on the
/// screen; null for a key that goes to no row.
[[nodiscard]] std::optional<NSInteger> rowByKey(int key, NSInteger from, NSInteger last,
                                                NSInteger page);

} // namespace quorl
