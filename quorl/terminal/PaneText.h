#pragma once

#include <string>

#include "quorl/content/PaneContent.h"

namespace quorl {

/// A pane as last drawn, as lines of text: its title, then its groups with numbered rows; footers
/// are wrapped to `width` columns. Of a longer pane, what is on the screen, with a line that says
/// so. Control characters are replaced.
[[nodiscard]] std::string textOf(const PaneContent& content, int width);

/// `text` broken at spaces into lines of at the most `width` characters, each after `indent` and
/// before a line feed. A longer word has a line of its own.
[[nodiscard]] std::string wrapped(const std::string& text, int width, const std::string& indent);

} // namespace quorl
