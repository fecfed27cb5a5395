#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include <sdbus-c++/sdbus-c++.h>

#include "quorl-syncd/notices/NoticeBoard.h"

namespace quorl::syncd {

/// Shows notices by the notification service of the desktop, and opens the app when a person picks
/// one. Never waits for the service: where there is none, or it does not answer, nothing is shown.
/// The bus loop's thread.
class DesktopNotices final : public NoticeBoard {
  public:
    /// @param bus outlives this.
    explicit DesktopNotices(sdbus::IConnection& bus);

    /// Withdraws the notice that is there, for nobody would open the app from it any more.
    ~DesktopNotices() override;

    DesktopNotices(const DesktopNotices&) = delete;
    DesktopNotices& operator=(const DesktopNotices&) = delete;

    void show(const DesktopNotice& notice) override;
    void withdraw() override;

  private:
    /// What the service calls a notice; 0 for none.
    using Number = std::uint32_t;
    using Abilities = std::vector<std::string>;

    void settle();
    void ask();
    void send(const Abilities& abilities);
    void close();
    void noteAnswer(const sdbus::Error* error);
    void hear(sdbus::Message& signal);
    void openApp();

    const std::unique_ptr<sdbus::IProxy> service_;
    const std::unique_ptr<sdbus::IProxy> app_;
    std::optional<DesktopNotice> wanted_; ///< nothing for no notice
    bool isSettled_ = true;               ///< What is wanted is there, or on its way.
    bool isUnderWay_ = false;             ///< The service has not answered yet.
    bool isProblemTold_ = false;
    Number shown_ = 0;
    std::string token_; ///< lets the app come to the front; empty for none
    // The last members, for they call this object.
    const sdbus::Slot signals_;
    const sdbus::Slot owners_;
};

} // namespace quorl::syncd
