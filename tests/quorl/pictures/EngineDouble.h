#pragma once

#include <memory>
#include <string>
#include <vector>

#include "services/engine/EngineState.h"

namespace quorl::tests {

/// On the session bus, in place of the sync engine: says what a test makes up, and does nothing.
class EngineDouble {
  public:
    /// Is on the bus, under the engine's name, from here on.
    explicit EngineDouble(const engine::EngineState& state);
    EngineDouble(const EngineDouble&) = delete;
    EngineDouble& operator=(const EngineDouble&) = delete;
    ~EngineDouble();

  private:
    template <class State>
    void publish(const std::string& path, const State& state);

    const std::unique_ptr<sdbus::IConnection> bus_;
    std::vector<std::unique_ptr<sdbus::IObject>> objects_;
};

} // namespace quorl::tests
