#pragma once

#include <functional>

#include <sdbus-c++/sdbus-c++.h>

#include "quorl-syncd/engine/ports/Announcer.h"

namespace quorl::syncd {

/// Tells clients on the bus. The bus loop's thread.
class BusAnnouncer final : public Announcer {
  public:
    /// @param bus outlives the announcer and its sessions.
    /// @param publish tells of the state of the engine.
    BusAnnouncer(sdbus::IConnection& bus, std::function<void()> publish);

    void stateDidChange() override { publish_(); }

    [[nodiscard]] std::unique_ptr<SessionReport>
    beginSession(std::uint64_t number, std::function<void()> cancel) override;

  private:
    sdbus::IConnection& bus_;
    const std::function<void()> publish_;
};

} // namespace quorl::syncd
