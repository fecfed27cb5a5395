#pragma once

#include <stdexcept>

#include "services/engine/Message.h"

namespace quorl::syncd {

/// The engine cannot do what a client asks for now. The text is a sentence for the user.
class NotReady : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;

    explicit NotReady(const engine::Message& message)
        : std::runtime_error(engine::sentence(message)) {}
};

} // namespace quorl::syncd
