#pragma once

#include "quorl/pages/AppPage.h"

namespace quorl {

/// The wearables that were found, of which a tap chooses one for good. Main thread.
class WearablesPage final : public AppPage {
  public:
    [[nodiscard]] bool init() override;
    void viewWillAppear(bool animated) override;
    void viewDidDisappear(bool animated) override;

  protected:
    [[nodiscard]] Rows rows() override;

  private:
    void addOffers(Rows& rows);
    void addMissing(Rows& rows);
    void addRemovals(Rows& rows);

    void choose(const std::shared_ptr<NSObject>& nothing, const Row& row);
    void eject(const std::shared_ptr<NSObject>& nothing, const Row& row);
    void chooseOther(const std::shared_ptr<NSObject>& nothing, const Row& row);
};

} // namespace quorl
