#include "doubles/HostDouble.h"

#include <array>
#include <charconv>

namespace quorl {

namespace {

/// Whole, however large: a float holds whole bytes only.
std::string rawSizeText(float bytes) {
    std::array<char, 64> digits{}; // the largest float has 39
    const auto written =
        std::to_chars(digits.begin(), digits.end(), bytes, std::chars_format::fixed, 0);
    return std::string(digits.begin(), written.ptr) + " B";
}

} // namespace

HostDouble::HostDouble(std::shared_ptr<CallRecorder> recorder)
    : sessionService(recorder),
      wearable(recorder),
      recorder_(recorder),
      library_(std::make_shared<LibraryDouble>(recorder)),
      syncDefaults_(std::make_shared<SyncDefaultsDouble>(preferences, recorder)),
      center_(std::make_shared<NotificationCenterDouble>(recorder)),
      screen_(recorder) {
    VirtualTime::shared().setObserver(
        [recorder = std::move(recorder)](auto function, auto figures) {
            recorder->dispatchWillBeCalled(function, figures);
        });
}

NSArray<DVSession> HostDouble::sessions(const std::string& type) {
    return sessionService.ofType(type);
}

std::shared_ptr<WearableConnection> HostDouble::connectToWearable(dispatch_queue_t queue) {
    return wearable.connect(queue);
}

std::shared_ptr<PSSpecifier> HostDouble::glanceSpecifier(const std::string& identifier) {
    recorder_->hostWillGiveGlance(identifier);
    return glance;
}

double HostDouble::secondsSince1970() {
    constexpr double nanoseconds = 1e9;
    return static_cast<double>(clock.read().count()) / nanoseconds;
}

std::optional<std::string> HostDouble::textForKey(const StringTable& table, const std::string& key,
                                                  const std::optional<std::string>& value) {
    recorder_->hostWillLookUpText(key, value);
    const auto found = texts.find(key);
    return found == texts.end() ? Host::textForKey(table, key, value) : found->second;
}

std::string HostDouble::sizeText(float bytes) {
    recorder_->hostWillFormatSize(bytes);
    return sizeTexts == SizeTexts::Raw ? rawSizeText(bytes) : Host::sizeText(bytes);
}

} // namespace quorl
