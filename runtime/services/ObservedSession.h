#pragma once

#include <functional>
#include <mutex>

#include "platform/SyncSessions.h"

namespace quorl {

/// A session's list of observers, for hosts to derive their sessions from. Any thread.
class ObservedSession : public DVSession {
  public:
    void addObserver(const std::shared_ptr<DVSessionObserver>& observer) override;
    void removeObserver(const std::shared_ptr<DVSessionObserver>& observer) override;

    /// Calls `call` with each observer that is attached at this moment, in the order of attachment.
    void tellObservers(const std::function<void(DVSessionObserver&)>& call) const;

  private:
    mutable std::mutex mutex_;
    std::vector<std::weak_ptr<DVSessionObserver>> observers_;
};

} // namespace quorl
