#pragma once

#include "quorl/pages/AppPage.h"

namespace quorl {

/// Asks once before all synced music is removed from the wearable. Main thread.
class RemovePage final : public AppPage {
  public:
    [[nodiscard]] bool init() override;

  protected:
    [[nodiscard]] Rows rows() override;

  private:
    void remove(const std::shared_ptr<NSObject>& nothing, const Row& row);
};

} // namespace quorl
