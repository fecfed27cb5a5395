#pragma once

#include <QString>

namespace quorl {

/// A text as one that searches it means it: without accents, upper case and lower case the same.
[[nodiscard]] QString folded(const QString& text);

} // namespace quorl
