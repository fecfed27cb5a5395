#pragma once

#include <string>
#include <variant>

#include "services/finding/Finder.h"

namespace quorl {

/// The directory of the wearable that is meant by a name, a path or "this-device", for which it is
/// empty; or a sentence that says why there is none, or more than one. A relative path counts from
/// where the program was started.
[[nodiscard]] std::variant<std::filesystem::path, std::string>
findOffered(const finding::Found& found, const std::string& nameOrPath);

} // namespace quorl
