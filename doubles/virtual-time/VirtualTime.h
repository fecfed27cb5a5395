#pragma once

#include <cstdint>
#include <deque>
#include <functional>
#include <initializer_list>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <string_view>
#include <unordered_map>

#include "platform/Dispatch.h"

namespace quorl {

/// A main queue and timers that follow a clock which moves only by `advance`.
///
/// A program that links the library `virtual-time` defines the functions of libdispatch that deal
/// with the main queue and with time, so that libraries and plug-ins in the same process come here
/// instead of to libdispatch. In any other program the clock stands still at 0. Doubled are
/// `dispatch_async_f`, `dispatch_after_f`, `dispatch_time`, timer sources with a handler function,
/// and what manages such a source. What is not about the main queue or a timer goes on to
/// libdispatch.
///
/// One for the process, as the main queue is. Work may be queued and timers may be armed on any
/// thread; everything runs on the thread that calls `drain` and `advance`.
class VirtualTime {
  public:
    /// Since the start of the process.
    using Nanoseconds = std::uint64_t;

    /// The latest instant that the clock can show, 292 years.
    static constexpr Nanoseconds end = INT64_MAX;

    /// Is told of the calls that code makes: the function's name and its figures. Times count from
    /// now; `DISPATCH_TIME_FOREVER` stands for itself. On the thread of the caller.
    using Observer = std::function<void(std::string_view function,
                                        std::initializer_list<std::uint64_t> figures)>;

    [[nodiscard]] static VirtualTime& shared();

    [[nodiscard]] Nanoseconds now() const;

    /// Runs what the main queue holds, and the timers that are due by now, until neither is left.
    void drain();

    /// Moves the clock on by `duration`, at the most to `end`. The timers that fall due on the way
    /// fire at their instant, those of one instant in the order in which they were armed; after
    /// each the main queue is run. Where no timer falls due the main queue is left as it is.
    void advance(Nanoseconds duration);

    /// Queues `work` when `delay` has passed. For the host itself: no observer is told.
    void schedule(Nanoseconds delay, std::function<void()> work);

    /// Null for none. To be set before other threads queue work.
    void setObserver(Observer observer) { observer_ = std::move(observer); }

    // What the doubled functions do. Those that are given an object give false, or null, where it
    // is none of theirs and libdispatch is to be asked.

    void async(void* context, dispatch_function_t work);
    void after(dispatch_time_t when, dispatch_queue_t target, void* context,
               dispatch_function_t work);
    [[nodiscard]] dispatch_time_t time(dispatch_time_t when, std::int64_t delta) const;
    [[nodiscard]] dispatch_source_t createTimer(dispatch_queue_t queue);
    bool setTimer(dispatch_source_t object, dispatch_time_t start, std::uint64_t interval,
                  std::uint64_t leeway);
    bool setHandler(dispatch_source_t object, dispatch_function_t handler);
    bool setContext(const void* object, void* context);
    bool setFinalizer(const void* object, dispatch_function_t finalizer);
    bool resume(const void* object);
    bool suspend(const void* object);
    bool cancel(const void* object);
    bool retain(const void* object);
    bool release(const void* object);

  private:
    struct Source;

    /// A timer's place in time: when it is due, and as which it was armed.
    struct Moment {
        Nanoseconds due;
        std::uint64_t order;

        // The check takes the defaulted comparison with zero for a pointer.
        // NOLINTNEXTLINE(modernize-use-nullptr)
        [[nodiscard]] auto operator<=>(const Moment&) const = default;
    };

    using Work = std::function<void()>;
    using Lock = std::unique_lock<std::mutex>;

    VirtualTime() = default;

    void tell(std::string_view function, std::initializer_list<std::uint64_t> figures) const;
    [[nodiscard]] std::uint64_t fromNow(dispatch_time_t when) const;
    [[nodiscard]] std::shared_ptr<Source> find(const void* object) const;
    void queue(dispatch_queue_t target, Work work);
    void arm(Moment moment, Work fire);
    void arm(const std::shared_ptr<Source>& source);
    void disarm(Source& source);
    void fire(const std::shared_ptr<Source>& source);
    void runMainQueue();
    bool fireNextTimer(Nanoseconds until);

    mutable std::mutex mutex_;
    Nanoseconds now_ = 0;
    std::uint64_t armed_ = 0; ///< how often a timer was armed
    std::deque<Work> mainQueue_;
    std::map<Moment, Work> timers_;
    std::unordered_map<const void*, std::shared_ptr<Source>> sources_;

    bool isDraining_ = false; ///< the draining thread only
    Observer observer_;
};

} // namespace quorl
