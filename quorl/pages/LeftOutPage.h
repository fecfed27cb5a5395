#pragma once

#include "quorl/pages/AppPage.h"

namespace quorl {

/// The songs of the chosen playlist that cannot be sent, under the reason for each. Main thread.
class LeftOutPage final : public AppPage {
  public:
    [[nodiscard]] bool init() override;

  protected:
    [[nodiscard]] Rows rows() override;
};

} // namespace quorl
