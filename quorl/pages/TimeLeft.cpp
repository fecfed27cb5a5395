#include "quorl/pages/TimeLeft.h"

#include <cmath>

namespace quorl {

namespace {

constexpr double minute = 60;
constexpr double hour = 60 * minute;

/// A machine that copies so slowly has stopped.
constexpr double longest = 100 * hour;

std::string about(double count, const std::string& unit) {
    const auto number = static_cast<int>(std::lround(count));
    return "About " + std::to_string(number) + " " + unit + (number == 1 ? "" : "s");
}

} // namespace

std::string timeLeft(const engine::SessionState& session) {
    if (!session.isProgressValid || session.isFinished || session.rate == 0) {
        return {};
    }
    const double bytesLeft = static_cast<double>(session.bytes) * (1 - double(session.progress));
    const double seconds = bytesLeft / static_cast<double>(session.rate);
    if (seconds > longest) {
        return {};
    }
    return seconds < minute       ? "Less than a minute"
           : seconds < 1.5 * hour ? about(seconds / minute, "minute")
                                  : about(seconds / hour, "hour");
}

} // namespace quorl
