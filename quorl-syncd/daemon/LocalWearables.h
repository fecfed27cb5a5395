#pragma once

#include <cstdint>
#include <filesystem>
#include <functional>
#include <string>

#include "quorl-syncd/engine/ports/WearablePort.h"
#include "services/base/Purpose.h"
#include "services/engine/BusLoop.h"
#include "services/engine/Message.h"

namespace quorl::syncd {

/// Wearables that are directories of this machine, which tell of themselves through a loop.
class LocalWearables final : public WearablePort {
  public:
    /// Says why what is in the directory of a mounted wearable is not that wearable, as a sentence;
    /// empty where it may be. Called before each look, on any thread, also when this is gone
    /// already, so it must own all that it uses.
    using Objection = std::function<engine::Message(const std::filesystem::path& directory)>;

    /// @param embeddedCapacity of the embedded wearable, in bytes.
    LocalWearables(engine::BusLoop& loop, base::Purpose purpose, std::uint64_t embeddedCapacity,
                   Objection objection)
        : loop_(loop),
          purpose_(purpose),
          embeddedCapacity_(embeddedCapacity),
          objection_(std::move(objection)) {}

    [[nodiscard]] std::unique_ptr<WatchedWearable> watch(const std::string& directory,
                                                         Noticed noticed) override;

  private:
    engine::BusLoop& loop_;
    const base::Purpose purpose_;
    const std::uint64_t embeddedCapacity_;
    const Objection objection_;
};

} // namespace quorl::syncd
