#pragma once

#include "platform/UserInterface.h"
#include "quorl-script/output/Json.h"

namespace quorl {

/// What a person would see of `panes`, as last drawn: nothing is asked of them.
[[nodiscard]] JsonList snapshotOf(const std::vector<std::shared_ptr<UIViewController>>& panes);

} // namespace quorl
