#pragma once

#include <string>

namespace quorl::tests {

/// The value of a shared preference, as another program reads it.
[[nodiscard]] std::string storedPreference(const std::string& key);

/// Writes a shared preference as another program does.
void storePreference(const std::string& key, const std::string& value);

} // namespace quorl::tests
