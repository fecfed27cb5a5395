#pragma once

#include <deque>

#include "doubles/virtual-time/VirtualTime.h"
#include "quorl-script/Trace.h"
#include "runtime/services/WearableConnection.h"

namespace quorl {

/// The storage figures of a wearable, in bytes; null for one that it does not tell.
struct UsageFigures {
    std::optional<double> available;
    std::optional<double> songs;
};

/// How the wearable answers a request.
struct UsageAnswer {
    bool isHeld = false;                 ///< not until there is another answer
    std::optional<UsageFigures> figures; ///< null: an error
    VirtualTime::Nanoseconds delay = 0;
};

/// The wearable of a script; at first it answers with an error. Main thread.
class ScriptedWearable {
  public:
    explicit ScriptedWearable(std::shared_ptr<Trace> trace) : trace_(std::move(trace)) {}

    /// A connection for a client whose replies run on `queue`. The wearable outlives it.
    [[nodiscard]] std::shared_ptr<WearableConnection> connect(dispatch_queue_t queue);

    /// From now on; held requests are answered now, in the order of asking.
    void setAnswer(const UsageAnswer& answer);

    void request(LSSManager::UsageHandler reply);

  private:
    void answer(LSSManager::UsageHandler reply) const;

    std::shared_ptr<Trace> trace_;
    UsageAnswer answer_;
    std::deque<LSSManager::UsageHandler> held_;
};

} // namespace quorl
