#include "quorl/terminal/TextScreen.h"

#include "quorl/terminal/sheets/TerminalText.h"
#include "services/base/Utf8.h"

namespace quorl {

namespace {

constexpr CGFloat columns = 80;

} // namespace

CGFloat TextScreen::scale() const { return 1; }

CGSize TextScreen::rowSize() const { return {columns, 1}; }

CGSize TextScreen::sizeOfText(const UILabel& label) const {
    const auto text = base::printable(label.text().value_or(""));
    return {static_cast<CGFloat>(columnsOf(text)), static_cast<CGFloat>(text.empty() ? 0 : 1)};
}

} // namespace quorl
