#pragma once

#include <array>
#include <cstddef>
#include <optional>
#include <string_view>

#include "quorl-syncd/transfer/pace/Clock.h"

namespace quorl::simulation {

/// What can be in the way of a sync, or end one.
enum class Trouble {
    Full,
    WriteProtected,
    Away,
    BadManifest,
    SongGone,
    SongChanged,
    SongUnreadable,
    SongTooLarge,
    BadPreferences,
    OtherChoice,
    ListGone,
    OtherAttachment,
    Cancelled,
    Ended,
};

/// What was in the way lately, by which it is judged what the engine says of a session.
class Troubles {
  public:
    using TimePoint = syncd::Clock::TimePoint;

    /// It is in the way now.
    void note(Trouble trouble, TimePoint now) { last_.at(static_cast<std::size_t>(trouble)) = now; }

    void sessionBegins(TimePoint now) { session_ = now; }

    /// Whether a sentence tells of a success, or of something that was in the way during the
    /// session, or so short a time before that the engine may have heard of it afterwards.
    [[nodiscard]] bool explain(std::string_view sentence) const;

  private:
    static constexpr auto count = static_cast<std::size_t>(Trouble::Ended) + 1;

    std::array<std::optional<TimePoint>, count> last_;
    TimePoint session_;
};

} // namespace quorl::simulation
