#pragma once

#include "quorl/pages/AppPage.h"

namespace quorl {

/// The page of the wearable, below all panes: how it stands, how the sync does, and the pane that
/// the app offers for it. Main thread.
class FrontPage final : public AppPage {
  public:
    /// A page with the services, which outlive it. `pane` is what its last row opens, under that
    /// name.
    [[nodiscard]] static std::shared_ptr<FrontPage> over(PageServices& services, const Class& pane,
                                                         const std::string& paneName);

    /// Before the page is shown: one more pane that it opens, or why it does not.
    void addPane(const Class& pane, const std::string& name);
    void addProblem(const std::string& text);

    /// The row that opens the pane.
    [[nodiscard]] const std::shared_ptr<PSSpecifier>& paneRow() const { return paneRow_; }

  protected:
    [[nodiscard]] Rows rows() override;

  private:
    void addWearable(Rows& rows);
    [[nodiscard]] Row chargerRow();
    void setOnCharger(const std::shared_ptr<NSObject>& isOn, const Row& row);

    Row paneRow_;
    Rows otherRows_;
};

} // namespace quorl
