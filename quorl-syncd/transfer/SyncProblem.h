#pragma once

#include <stdexcept>
#include <utility>

#include "services/engine/Message.h"

namespace quorl::syncd {

/// Why a sync cannot be done.
class SyncProblem : public std::runtime_error {
  public:
    explicit SyncProblem(engine::Message message)
        : std::runtime_error(engine::sentence(message)), message_(std::move(message)) {}

    [[nodiscard]] const engine::Message& message() const { return message_; }

  private:
    engine::Message message_;
};

} // namespace quorl::syncd
