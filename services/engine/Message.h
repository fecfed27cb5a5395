#pragma once

#include <string>
#include <vector>

#include "services/language/CodedMessage.h"

namespace quorl::engine {

/// What an engine tells; its code is one of Codes.h. Another engine may have others.
using Message = language::CodedMessage;

/// In the language that is followed, in a sentence or several; empty for a code that is not known.
/// Arguments that are missing leave a gap, and too many are ignored. Control characters in paths
/// are replaced.
[[nodiscard]] std::string sentence(const Message& message);

/// A message of which nothing but its sentence is known.
[[nodiscard]] Message other(std::string sentence);

/// As one list, to be an argument of another message: its code, then its arguments.
[[nodiscard]] std::vector<std::string> flat(const Message& message);

} // namespace quorl::engine
