#pragma once

#include <condition_variable>
#include <functional>
#include <memory>
#include <mutex>
#include <vector>

namespace quorl::finding::test {

/// What was told on another thread.
template <class T>
class Told {
  public:
    /// To be handed to whoever tells; owns all that it uses.
    [[nodiscard]] std::function<void(const T&)> tell() const {
        return [log = log_](const T& value) {
            const std::scoped_lock lock(log->mutex);
            log->values.push_back(value);
            log->changed.notify_all();
        };
    }

    /// Waits until the last value that was told is as `condition` has it, and gives it back.
    template <class Condition>
    T waitFor(Condition condition) const {
        std::unique_lock lock(log_->mutex);
        log_->changed.wait(lock,
                           [&] { return !log_->values.empty() && condition(log_->values.back()); });
        return log_->values.back();
    }

  private:
    struct Log {
        std::mutex mutex;
        std::condition_variable changed;
        std::vector<T> values;
    };

    const std::shared_ptr<Log> log_ = std::make_shared<Log>();
};

} // namespace quorl::finding::test
