#pragma once

#include <cstdint>

#include "quorl-syncd/engine/ports/WearablePort.h"
#include "services/base/Purpose.h"
#include "services/engine/BusLoop.h"

namespace quorl::syncd {

/// Wearables that are directories of this machine, which tell of themselves through a loop.
class LocalWearables final : public WearablePort {
  public:
    /// @param embeddedCapacity of the embedded wearable, in bytes.
    LocalWearables(engine::BusLoop& loop, base::Purpose purpose, std::uint64_t embeddedCapacity)
        : loop_(loop), purpose_(purpose), embeddedCapacity_(embeddedCapacity) {}

    [[nodiscard]] std::unique_ptr<WatchedWearable> watch(const std::string& directory,
                                                         Noticed noticed) override;

  private:
    engine::BusLoop& loop_;
    const base::Purpose purpose_;
    const std::uint64_t embeddedCapacity_;
};

} // namespace quorl::syncd
