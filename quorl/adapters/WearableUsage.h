#pragma once

#include <memory>

#include "runtime/services/WearableConnection.h"
#include "services/wearable/Wearable.h"

namespace quorl {

/// What is asked of the wearable, and answered without anybody waiting for a slow device. Main
/// thread.
class WearableUsage {
  public:
    explicit WearableUsage(const wearable::Wearable& wearable);

    /// Has what is asked from now on asked of another one.
    void setWearable(const wearable::Wearable& wearable);

    /// A connection for one client, which may outlive this object.
    [[nodiscard]] std::shared_ptr<WearableConnection> connect() const;

    /// Whether every question that was asked through a connection has been answered, and the answer
    /// has been taken on the main queue.
    [[nodiscard]] bool isIdle() const;

  private:
    class Client;
    struct Questions;
    struct Chosen;

    std::shared_ptr<Chosen> chosen_;
};

} // namespace quorl
