#include "doubles/virtual-time/VirtualTime.h"

#include <algorithm>
#include <limits>
#include <utility>

namespace quorl {

namespace {

// Instant 0 is written as 1 in a dispatch_time_t, since 0 means now; so an instant is one less.
constexpr dispatch_time_t timeOf(VirtualTime::Nanoseconds instant) { return instant + 1; }

} // namespace

struct VirtualTime::Source {
    dispatch_queue_t queue = nullptr;
    void* context = nullptr;
    dispatch_function_t handler = nullptr;
    dispatch_function_t finalizer = nullptr;
    std::optional<Moment> moment; ///< null while disarmed
    std::uint64_t interval = DISPATCH_TIME_FOREVER;
    int suspensions = 1;
    int references = 1;
    bool isCancelled = false;
};

VirtualTime& VirtualTime::shared() {
    static auto* const time = new VirtualTime; // work may be queued until the process ends
    return *time;
}

VirtualTime::Nanoseconds VirtualTime::now() const {
    const Lock lock(mutex_);
    return now_;
}

void VirtualTime::drain() {
    if (std::exchange(isDraining_, true)) {
        return;
    }
    do {
        runMainQueue();
    } while (fireNextTimer(now()));
    isDraining_ = false;
}

void VirtualTime::advance(Nanoseconds duration) {
    const Nanoseconds target = duration > end - now() ? end : now() + duration;
    while (fireNextTimer(target)) {
        drain();
    }
    const Lock lock(mutex_);
    now_ = target;
}

void VirtualTime::schedule(Nanoseconds delay, Work work) {
    const Lock lock(mutex_);
    arm({std::min(delay, end - now_) + now_, armed_++},
        [this, work = std::move(work)] { queue(dispatch_get_main_queue(), work); });
}

void VirtualTime::async(void* context, dispatch_function_t work) {
    const Lock lock(mutex_);
    mainQueue_.emplace_back([context, work] { work(context); });
}

void VirtualTime::after(dispatch_time_t when, dispatch_queue_t target, void* context,
                        dispatch_function_t work) {
    const std::uint64_t delay = fromNow(when);
    tell("dispatch_after", {delay});
    if (delay == 0) {
        queue(target, [context, work] { work(context); });
    } else if (delay != DISPATCH_TIME_FOREVER) {
        const Lock lock(mutex_);
        arm({now_ + delay, armed_++},
            [this, target, context, work] { queue(target, [context, work] { work(context); }); });
    }
}

dispatch_time_t VirtualTime::time(dispatch_time_t when, std::int64_t delta) const {
    if (when == DISPATCH_TIME_FOREVER) {
        return DISPATCH_TIME_FOREVER;
    }
    const bool isNow = when == DISPATCH_TIME_NOW || when == DISPATCH_WALLTIME_NOW;
    const auto base = static_cast<std::int64_t>(isNow ? now() : when - 1);
    if (delta > std::numeric_limits<std::int64_t>::max() - base) {
        return DISPATCH_TIME_FOREVER;
    }
    return timeOf(static_cast<Nanoseconds>(std::max<std::int64_t>(base + delta, 0)));
}

dispatch_source_t VirtualTime::createTimer(dispatch_queue_t queue) {
    tell("dispatch_source_create", {});
    auto source = std::make_shared<Source>();
    source->queue = queue;
    const Lock lock(mutex_);
    sources_.emplace(source.get(), source);
    return reinterpret_cast<dispatch_source_t>(source.get());
}

bool VirtualTime::setTimer(dispatch_source_t object, dispatch_time_t start, std::uint64_t interval,
                           std::uint64_t leeway) {
    const auto source = find(object);
    if (!source) {
        return false;
    }
    const std::uint64_t delay = fromNow(start);
    tell("dispatch_source_set_timer", {delay, interval, leeway});
    const Lock lock(mutex_);
    disarm(*source);
    if (delay != DISPATCH_TIME_FOREVER) {
        source->moment = Moment{now_ + delay, armed_++};
        source->interval = interval;
        arm(source);
    }
    return true;
}

bool VirtualTime::setHandler(dispatch_source_t object, dispatch_function_t handler) {
    const auto source = find(object);
    if (source) {
        source->handler = handler;
    }
    return source != nullptr;
}

bool VirtualTime::setContext(const void* object, void* context) {
    const auto source = find(object);
    if (source) {
        source->context = context;
    }
    return source != nullptr;
}

bool VirtualTime::setFinalizer(const void* object, dispatch_function_t finalizer) {
    const auto source = find(object);
    if (source) {
        source->finalizer = finalizer;
    }
    return source != nullptr;
}

bool VirtualTime::resume(const void* object) {
    const auto source = find(object);
    if (!source) {
        return false;
    }
    tell("dispatch_resume", {});
    const Lock lock(mutex_);
    if (source->suspensions > 0 && --source->suspensions == 0) {
        arm(source);
    }
    return true;
}

bool VirtualTime::suspend(const void* object) {
    const auto source = find(object);
    if (!source) {
        return false;
    }
    const Lock lock(mutex_);
    ++source->suspensions;
    if (source->moment) {
        timers_.erase(*source->moment);
    }
    return true;
}

bool VirtualTime::cancel(const void* object) {
    const auto source = find(object);
    if (!source) {
        return false;
    }
    tell("dispatch_source_cancel", {});
    const Lock lock(mutex_);
    source->isCancelled = true;
    disarm(*source);
    return true;
}

bool VirtualTime::retain(const void* object) {
    const auto source = find(object);
    if (source) {
        const Lock lock(mutex_);
        ++source->references;
    }
    return source != nullptr;
}

bool VirtualTime::release(const void* object) {
    const auto source = find(object);
    if (!source) {
        return false;
    }
    const Lock lock(mutex_);
    if (--source->references > 0) {
        return true;
    }
    disarm(*source);
    source->isCancelled = true;
    sources_.erase(object);
    if (source->finalizer) {
        // Later: the handler that released its own source still stands on what this destroys.
        mainQueue_.emplace_back([source] { source->finalizer(source->context); });
    }
    return true;
}

void VirtualTime::tell(std::string_view function,
                       std::initializer_list<std::uint64_t> figures) const {
    if (observer_) {
        observer_(function, figures);
    }
}

std::uint64_t VirtualTime::fromNow(dispatch_time_t when) const {
    if (when == DISPATCH_TIME_FOREVER) {
        return DISPATCH_TIME_FOREVER;
    }
    const Nanoseconds current = now();
    return when == DISPATCH_TIME_NOW || when <= timeOf(current) ? 0 : when - timeOf(current);
}

std::shared_ptr<VirtualTime::Source> VirtualTime::find(const void* object) const {
    const Lock lock(mutex_);
    const auto found = sources_.find(object);
    return found == sources_.end() ? nullptr : found->second;
}

void VirtualTime::queue(dispatch_queue_t target, Work work) {
    if (target == dispatch_get_main_queue()) {
        const Lock lock(mutex_);
        mainQueue_.push_back(std::move(work));
        return;
    }
    dispatch_async(target, std::move(work));
}

void VirtualTime::arm(Moment moment, Work fire) { timers_.emplace(moment, std::move(fire)); }

void VirtualTime::arm(const std::shared_ptr<Source>& source) {
    if (source->moment && source->suspensions == 0 && !source->isCancelled) {
        arm(*source->moment, [this, source] { fire(source); });
    }
}

void VirtualTime::disarm(Source& source) {
    if (source.moment) {
        timers_.erase(*source.moment);
        source.moment.reset();
    }
}

void VirtualTime::fire(const std::shared_ptr<Source>& source) {
    {
        const Lock lock(mutex_);
        const Nanoseconds due = std::exchange(source->moment, std::nullopt)->due;
        // As libdispatch has it, an interval of nothing would be one of a nanosecond: no clock of
        // this kind would ever get past it, so it counts as none.
        if (source->interval != 0 && source->interval <= end - due) {
            source->moment = Moment{due + source->interval, armed_++};
            arm(source);
        }
    }
    queue(source->queue, [source] {
        if (source->handler && !source->isCancelled) {
            source->handler(source->context);
        }
    });
}

void VirtualTime::runMainQueue() {
    for (;;) {
        Lock lock(mutex_);
        if (mainQueue_.empty()) {
            return;
        }
        const Work work = std::move(mainQueue_.front());
        mainQueue_.pop_front();
        lock.unlock();
        work();
    }
}

bool VirtualTime::fireNextTimer(Nanoseconds until) {
    Lock lock(mutex_);
    if (timers_.empty() || timers_.begin()->first.due > until) {
        return false;
    }
    now_ = std::max(now_, timers_.begin()->first.due);
    const auto timer = timers_.extract(timers_.begin());
    lock.unlock();
    timer.mapped()();
    return true;
}

} // namespace quorl
