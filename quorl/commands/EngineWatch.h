#pragma once

#include <condition_variable>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <variant>

#include "services/engine/Client.h"

namespace quorl {

/// The sync engine, for a command that waits for what becomes of it. One thread.
class EngineWatch {
  public:
    /// Connects in the background, and starts the engine where it does not run.
    EngineWatch();

    using Condition = std::function<bool(const engine::EngineState& state)>;

    /// Waits until the engine is as `condition` has it, and gives back how it is then. Gives back
    /// why that does not come where the engine or the session bus is gone.
    [[nodiscard]] std::variant<std::shared_ptr<const engine::EngineState>, std::string>
    waitUntil(const Condition& condition);

    /// Asks the engine for something and waits for its answer: an empty text, or why it was not
    /// done.
    [[nodiscard]] std::string ask(void (engine::Client::*what)(engine::Client::Reply));

    /// The same with what it is to be given.
    [[nodiscard]] std::string tell(void (engine::Client::*what)(const std::string&,
                                                                engine::Client::Reply),
                                   const std::string& text);

  private:
    void take(const engine::Event& event);

    std::mutex mutex_;
    std::condition_variable changed_;
    std::shared_ptr<const engine::EngineState> state_; ///< null as long as nothing was heard
    std::string problem_;                              ///< why there is no engine
    engine::Client client_; ///< last: its thread uses the others until it ends
};

} // namespace quorl
