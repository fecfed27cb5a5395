#pragma once

#include <string>
#include <string_view>

namespace quorl::base {

/// `text` without ASCII white space at both ends.
[[nodiscard]] std::string_view trimmed(std::string_view text);

/// `text` itself where it is valid UTF-8, else `text` taken as Latin-1, in the reading that Windows
/// programs write: bytes 0x80 to 0x9F, control characters in Latin-1, are quotation marks and the
/// like.
[[nodiscard]] std::string toUtf8(std::string_view text);

/// `text` with every byte that is not part of valid UTF-8 replaced by U+FFFD.
[[nodiscard]] std::string validUtf8(std::string_view text);

/// `validUtf8` with everything replaced too that steers a terminal: control characters, separators
/// of lines, and what changes the direction of all that follows.
[[nodiscard]] std::string printable(std::string_view text);

/// `text` in Unicode normalisation form C (composed) or D (decomposed). Text that is not valid
/// UTF-8 is given back as it is.
[[nodiscard]] std::string composed(std::string_view text);
[[nodiscard]] std::string decomposed(std::string_view text);

/// What holds a NUL is valid only where all of it is ASCII.
[[nodiscard]] bool isUtf8(std::string_view text);

[[nodiscard]] bool isAscii(std::string_view text);

} // namespace quorl::base
