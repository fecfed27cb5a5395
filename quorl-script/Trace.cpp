#include "quorl-script/Trace.h"

#include <cmath>
#include <utility>

namespace quorl {

namespace {

constexpr std::string_view lifeReceiver = "life";

} // namespace

void Trace::recordDealloc(const std::string& className) {
    add(lifeReceiver, JsonList().add("dealloc").add(className));
}

void Trace::add(std::string_view receiver, JsonList entry) {
    const std::lock_guard lock(mutex_);
    if (!isSelected(receiver)) {
        return;
    }
    if (std::this_thread::get_id() != mainThread_) {
        entry.add("thread:other");
    }
    entries_.add(entry);
}

void Trace::select(std::optional<std::set<std::string, std::less<>>> receivers) {
    const std::lock_guard lock(mutex_);
    receivers_ = std::move(receivers);
}

JsonList Trace::take() {
    const std::lock_guard lock(mutex_);
    return std::exchange(entries_, {});
}

bool Trace::isSelected(std::string_view receiver) const {
    return pauses_ == 0 && (!receivers_ || receivers_->contains(receiver));
}

void Trace::pause(int change) {
    const std::lock_guard lock(mutex_);
    pauses_ += change;
}

Json numberOf(double value) {
    constexpr double limit = 18446744073709551616.0; // 2^64
    if (std::trunc(value) != value || std::abs(value) >= limit) {
        return Json(value);
    }
    if (value >= 0) {
        return Json(static_cast<std::uint64_t>(value));
    }
    return value >= -limit / 2 ? Json(static_cast<std::int64_t>(value)) : Json(value);
}

} // namespace quorl
