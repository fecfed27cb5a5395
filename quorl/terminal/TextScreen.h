#pragma once

#include "quorl/app/PaneScreen.h"

namespace quorl {

/// The screen that a terminal is: a point is a character, and every row is as wide as it wants.
/// Main thread.
class TextScreen final : public PaneScreen {
    Q_OBJECT

  public:
    [[nodiscard]] CGFloat scale() const override;
    [[nodiscard]] CGSize rowSize() const override;
    [[nodiscard]] CGSize sizeOfText(const UILabel& label) const override;
};

} // namespace quorl
