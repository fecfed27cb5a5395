#pragma once

#include "quorl/content/PaneContent.h"
#include "quorl/terminal/sheets/Sheet.h"

namespace quorl {

/// A text for people, as lines of a page in which each paragraph is a whole. Control characters are
/// replaced.
[[nodiscard]] std::vector<TextLine> paragraphs(const std::string& text, const SheetForm& form,
                                               const std::string& indent);

/// A pane as last drawn: its title, then its groups with numbered rows. Rows that are not on the
/// screen say nothing. Footers are wrapped, and rows too on a sheet that is rewritten are made to
/// fit so that both name and value can be read. Control characters are replaced.
[[nodiscard]] std::vector<TextLine> linesOf(const PaneContent& content, const SheetForm& form);

} // namespace quorl
