#pragma once

#include <cstdint>
#include <string>

namespace quorl::language {

/// As the followed language writes it: "1,234", "1.234", "١٬٢٣٤". Any thread.
[[nodiscard]] std::string numberText(std::uint64_t number);

/// "25%", "25 %", "٢٥٪". Any thread.
/// @param share of 1; what is less than a hundredth of it is left out.
[[nodiscard]] std::string percentText(double share);

/// "123 MB", "123 Mo". Any thread.
[[nodiscard]] std::string megabyteText(std::uint64_t megabytes);

} // namespace quorl::language
