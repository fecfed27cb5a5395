#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace quorl {

/// How many columns of a terminal `text` takes, at the most: terminals differ in how they show
/// characters that are joined into one. `text` is valid UTF-8, here and below.
[[nodiscard]] int columnsOf(std::string_view text);

/// As much of the beginning of `text` as fits into `columns`, with an ellipsis where something is
/// left out. No character is parted from its marks, or from those that it is joined with.
[[nodiscard]] std::string shortened(const std::string& text, int columns);

/// The same with the end of `text`.
[[nodiscard]] std::string shortenedToEnd(const std::string& text, int columns);

/// `text` but for the last character, as a person counts them.
[[nodiscard]] std::string withoutLastCharacter(const std::string& text);

/// `text` such that a terminal which reorders what is written from right to left leaves everything
/// around it in its place.
[[nodiscard]] std::string isolated(const std::string& text);

enum class LongWords { Whole, Broken };

/// The lines of `text`, each broken at spaces so that it takes at the most `columns`, and begun
/// with `indent`. A longer word begins a line of its own, and is broken where that is asked for. An
/// empty line stays empty.
[[nodiscard]] std::vector<std::string> wrapped(const std::string& text, int columns,
                                               const std::string& indent, LongWords longWords);

} // namespace quorl
