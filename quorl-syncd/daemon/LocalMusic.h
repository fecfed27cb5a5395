#pragma once

#include "quorl-syncd/engine/ports/MusicPort.h"
#include "services/engine/BusLoop.h"

namespace quorl::syncd {

/// Music folders of this machine, which tell of their changes through a loop.
class LocalMusic final : public MusicPort {
  public:
    explicit LocalMusic(engine::BusLoop& loop) : loop_(loop) {}

    [[nodiscard]] std::string usualFolder() override;
    [[nodiscard]] std::unique_ptr<WatchedMusic> watch(const std::string& folder,
                                                      Changed changed) override;

  private:
    engine::BusLoop& loop_;
};

} // namespace quorl::syncd
