#pragma once

#include "platform/PreferencesList.h"
#include "quorl/adapters/EngineLink.h"

namespace quorl {

/// The page of the wearable, below all panes: how it stands, what its last sync came to, and the
/// panes that the app offers for it. A list like any other, so that every way of showing panes
/// shows it. Main thread.
class FrontPage final : public PSListController {
  public:
    /// A page over `engine`, which outlives it. `pane` is what the app's one row opens, under that
    /// name; the charger of an embedded wearable is a switch, that of a device is only told.
    [[nodiscard]] static std::shared_ptr<FrontPage>
    over(EngineLink& engine, const Class& pane, const std::string& paneName, bool isEmbedded);

    /// The row that opens the pane.
    [[nodiscard]] const std::shared_ptr<PSSpecifier>& paneRow() const { return paneRow_; }

    /// Shows the engine's state of this moment.
    void refresh();

    [[nodiscard]] NSArray<PSSpecifier> specifiers() override;
    void viewWillAppear(bool animated) override;

  private:
    using Getter = std::optional<std::string> (FrontPage::*)(const std::shared_ptr<PSSpecifier>&);

    [[nodiscard]] std::optional<std::string> connection(const std::shared_ptr<PSSpecifier>& row);
    [[nodiscard]] std::optional<std::string> charger(const std::shared_ptr<PSSpecifier>& row);
    [[nodiscard]] std::optional<std::string> isOnCharger(const std::shared_ptr<PSSpecifier>& row);
    [[nodiscard]] std::optional<std::string> storage(const std::shared_ptr<PSSpecifier>& row);
    [[nodiscard]] std::optional<std::string> lastSync(const std::shared_ptr<PSSpecifier>& row);
    void setOnCharger(const std::shared_ptr<NSObject>& value,
                      const std::shared_ptr<PSSpecifier>& row);

    EngineLink* engine_ = nullptr;
    bool isEmbedded_ = true;
    std::shared_ptr<PSSpecifier> wearableGroup_;
    std::vector<std::shared_ptr<PSSpecifier>> rows_;
    std::shared_ptr<PSSpecifier> paneRow_;
};

} // namespace quorl
