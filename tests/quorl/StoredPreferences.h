#pragma once

#include <string>

#include "services/base/Purpose.h"

namespace quorl::tests {

/// The value of a shared preference, as another program reads it.
[[nodiscard]] std::string storedPreference(const std::string& key,
                                           base::Purpose purpose = base::Purpose::Use);

/// Writes a shared preference as another program does.
void storePreference(const std::string& key, const std::string& value);

} // namespace quorl::tests
