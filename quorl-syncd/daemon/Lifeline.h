#pragma once

#include <memory>
#include <utility>

namespace quorl::syncd {

/// A member of an object that hands work to a loop: work that is served when the object is gone
/// comes to nothing. It is to be served on the thread on which the object is destroyed.
class Lifeline {
  public:
    Lifeline() = default;
    Lifeline(const Lifeline&) = delete;
    Lifeline& operator=(const Lifeline&) = delete;

    /// `act`, as long as the lifeline is there. May be copied and destroyed on any thread.
    template <class Act>
    [[nodiscard]] auto whileThere(Act act) const {
        return
            [line = std::weak_ptr<const bool>(line_), act = std::move(act)](const auto&... given) {
                if (!line.expired()) {
                    act(given...);
                }
            };
    }

  private:
    std::shared_ptr<const bool> line_ = std::make_shared<const bool>(true);
};

} // namespace quorl::syncd
