#pragma once

#include <deque>

#include "doubles/CallRecorder.h"
#include "doubles/virtual-time/VirtualTime.h"
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

/// A wearable that answers as it is told to, at first with an error. Main thread.
class WearableDouble {
  public:
    explicit WearableDouble(std::shared_ptr<CallRecorder> recorder)
        : recorder_(std::move(recorder)) {}

    /// A connection for a client whose replies run on `queue`. The wearable outlives it.
    [[nodiscard]] std::shared_ptr<WearableConnection> connect(dispatch_queue_t queue);

    /// From now on; held requests are answered now, in the order of asking.
    void setAnswer(const UsageAnswer& answer);

    /// From now on requests are held until they are answered one by one, or by `setAnswer`.
    void holdReplies();

    /// How many requests are held.
    [[nodiscard]] std::size_t openQuestions() const { return held_.size(); }

    /// Takes the oldest request that is held, which the caller answers.
    [[nodiscard]] LSSManager::UsageHandler takeQuestion();

    /// Answers the oldest request that is held, whatever becomes of later ones.
    void reply(const UsageFigures& figures);
    void fail(const std::string& problem);

    void request(LSSManager::UsageHandler reply);

  private:
    void answer(LSSManager::UsageHandler reply) const;

    std::shared_ptr<CallRecorder> recorder_;
    UsageAnswer answer_;
    std::deque<LSSManager::UsageHandler> held_;
};

} // namespace quorl
