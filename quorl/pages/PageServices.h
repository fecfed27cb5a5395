#pragma once

#include "quorl/adapters/EngineLink.h"

namespace quorl {

/// What the app's own pages need of the app. Main thread.
class PageServices {
  public:
    PageServices() = default;
    PageServices(const PageServices&) = delete;
    PageServices& operator=(const PageServices&) = delete;

    [[nodiscard]] virtual const engine::EngineState& engineState() const = 0;

    /// Asks the engine for something. Why it was not done becomes a notice.
    virtual void ask(EngineLink::Request request) = 0;

    /// Whether the embedded wearable is to be taken for one on its charger.
    virtual void setOnCharger(bool isOnCharger) = 0;

  protected:
    ~PageServices() = default;
};

} // namespace quorl
