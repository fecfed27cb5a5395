#pragma once

#include <vector>

#include "services/engine/Event.h"

namespace quorl::engine {

/// Events on their way to a thread that is slower than the bus. News of the same task, or of the
/// engine, that were not fetched yet give way to later ones; everything else stays in its order.
/// One thread at a time.
class PendingEvents {
  public:
    void add(Event event);

    [[nodiscard]] bool isEmpty() const { return events_.empty(); }

    /// All of them, in order; there are none afterwards.
    [[nodiscard]] std::vector<Event> take();

  private:
    std::vector<Event> events_;
};

} // namespace quorl::engine
