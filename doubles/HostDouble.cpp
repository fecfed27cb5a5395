#include "doubles/HostDouble.h"

#include <array>
#include <cstdint>
#include <cstdio>

#include "doubles/NotificationCenterDouble.h"

namespace quorl {

namespace {

/// Whole, however large: a float holds whole bytes only.
std::string rawSizeText(float bytes) {
    std::array<char, 64> text{}; // the largest float has 39 digits
    const int length =
        std::snprintf(text.data(), text.size(), "%.0f B", static_cast<double>(bytes));
    return {text.data(), static_cast<std::size_t>(length)};
}

void recordDispatch(Trace& trace, std::string_view function,
                    std::initializer_list<std::uint64_t> figures) {
    Json entry = Json::array({"dispatch", function});
    for (const std::uint64_t figure : figures) {
        entry.push_back(figure == DISPATCH_TIME_FOREVER ? Json("forever") : Json(figure));
    }
    trace.add("dispatch", std::move(entry));
}

/// The sum, or what comes nearest to it where it does not fit.
std::int64_t saturatedSum(std::int64_t left, std::int64_t right) {
    std::int64_t sum = 0;
    if (__builtin_add_overflow(left, right, &sum)) {
        return right < 0 ? INT64_MIN : INT64_MAX;
    }
    return sum;
}

} // namespace

std::int64_t ScriptedClock::read() {
    const auto time = static_cast<std::int64_t>(VirtualTime::shared().now());
    const std::int64_t reading = saturatedSum(time, offset_);
    moveBy(tick_);
    return reading;
}

void ScriptedClock::moveBy(std::int64_t nanoseconds) {
    offset_ = saturatedSum(offset_, nanoseconds);
}

ScriptedHost::ScriptedHost()
    : trace_(std::make_shared<Trace>()),
      library_(std::make_shared<ScriptedLibrary>(trace_)),
      syncDefaults_(std::make_shared<TracingSyncDefaults>(preferences, trace_)),
      center_(std::make_shared<TracingNotificationCenter>(trace_)),
      sessions_(trace_),
      wearable_(trace_),
      screen_(trace_) {
    VirtualTime::shared().setObserver([trace = trace_](auto function, auto figures) {
        recordDispatch(*trace, function, figures);
    });
}

NSArray<DVSession> ScriptedHost::sessions(const std::string& type) {
    return sessions_.ofType(type);
}

std::shared_ptr<WearableConnection> ScriptedHost::connectToWearable(dispatch_queue_t queue) {
    return wearable_.connect(queue);
}

std::shared_ptr<PSSpecifier> ScriptedHost::glanceSpecifier(const std::string& identifier) {
    trace_->record("QPSNotificationAppController", "glanceSpecifierForIdentifier:", identifier);
    if (!glance) {
        return nullptr;
    }
    return PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
        glance, nullptr, std::nullopt, std::nullopt, std::nullopt, PSCellType::LinkList,
        std::nullopt);
}

double ScriptedHost::secondsSince1970() {
    constexpr double nanoseconds = 1e9;
    return static_cast<double>(clock.read()) / nanoseconds;
}

std::optional<std::string> ScriptedHost::textForKey(const StringTable& table,
                                                    const std::string& key,
                                                    const std::optional<std::string>& value) {
    trace_->record("NSBundle", "localizedStringForKey:value:table:", key, textOf(value), nullptr);
    const auto found = texts.find(key);
    return found == texts.end() ? Host::textForKey(table, key, value) : found->second;
}

std::string ScriptedHost::sizeText(float bytes) {
    trace_->record("CPFSSizeStrings", numberOf(static_cast<double>(bytes)));
    return hasRawSizes ? rawSizeText(bytes) : Host::sizeText(bytes);
}

} // namespace quorl
