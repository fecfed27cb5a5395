#pragma once

#include "quorl/pages/PageServices.h"

namespace quorl::tests {

/// A state of the engine that a test makes up, and what pages ask for.
class MadeUpServices final : public PageServices {
  public:
    MadeUpServices() {
        state.isThere = true;
        state.wearable.isEmbedded = true;
        state.wearable.isConnected = true;
    }

    [[nodiscard]] const engine::EngineState& engineState() const override { return state; }

    void ask(EngineLink::Request request) override { requests.push_back(request); }

    void setOnCharger(bool isOnCharger) override { state.wearable.isOnCharger = isOnCharger; }

    engine::EngineState state;
    std::vector<EngineLink::Request> requests;
};

} // namespace quorl::tests
