#pragma once

#include <stdexcept>

namespace quorl::syncd {

/// The engine cannot do what a client asks for now. The text is a sentence for the user.
class NotReady : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

} // namespace quorl::syncd
