#pragma once

#include "quorl/pages/AppPage.h"

namespace quorl {

/// How the sync does and what came of it, with what can be done about it. Main thread.
class SyncPage final : public AppPage {
  public:
    /// How the sync does, in a word or two.
    [[nodiscard]] static std::string summaryOf(const engine::EngineState& state);

    [[nodiscard]] bool init() override;
    void viewWillAppear(bool animated) override;

  protected:
    [[nodiscard]] Rows rows() override;

  private:
    void addSession(Rows& rows);
    void addWearable(Rows& rows);

    void syncNow(const std::shared_ptr<NSObject>& nothing, const Row& row);
    void stop(const std::shared_ptr<NSObject>& nothing, const Row& row);
    void setLoginStart(const std::shared_ptr<NSObject>& isOn, const Row& row);
    void setNotices(const std::shared_ptr<NSObject>& areOn, const Row& row);

    /// Asked for when the page appears, for it stands in a file. Null: it cannot be set here.
    std::optional<bool> startsAtLogin_;
};

} // namespace quorl
