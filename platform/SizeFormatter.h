#pragma once

#include <string>

/// A byte count as a text for a person, in the user's language, in units of 1024: "100 MB", "1.4
/// GB". Negative counts and NaN read as 0 bytes. Main thread.
[[nodiscard]] std::string CPFSSizeStrings(float bytes);
