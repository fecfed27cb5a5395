#include "quorl/pages/TimeLeft.h"

#include <cmath>
#include <cstdint>

#include "services/language/Translated.h"

namespace quorl {

using language::translated;
using language::translatedCount;

namespace {

constexpr double minute = 60;
constexpr double hour = 60 * minute;

/// A machine that copies so slowly has stopped.
constexpr double longest = 100 * hour;

std::uint64_t rounded(double count) { return static_cast<std::uint64_t>(std::lround(count)); }

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
    return seconds < minute       ? translated("Less than a minute")
           : seconds < 1.5 * hour ? translatedCount("About {count} minute", "About {count} minutes",
                                                    rounded(seconds / minute))
                                  : translatedCount("About {count} hour", "About {count} hours",
                                                    rounded(seconds / hour));
}

} // namespace quorl
