#include "quorl/terminal/TextScreen.h"

#include <QString>

namespace quorl {

namespace {

constexpr CGFloat columns = 80;

} // namespace

CGFloat TextScreen::scale() const { return 1; }

CGSize TextScreen::rowSize() const { return {columns, 1}; }

CGSize TextScreen::sizeOfText(const UILabel& label) const {
    const auto text = QString::fromStdString(label.text().value_or(""));
    return {static_cast<CGFloat>(text.size()), static_cast<CGFloat>(text.isEmpty() ? 0 : 1)};
}

} // namespace quorl
