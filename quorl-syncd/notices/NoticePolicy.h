#pragma once

#include <chrono>
#include <cstdint>
#include <optional>

#include "quorl-syncd/notices/DesktopNotice.h"
#include "quorl-syncd/transfer/pace/Clock.h"
#include "services/engine/EngineState.h"

/// What is told on the desktop, from plain values.
namespace quorl::syncd {

/// Nobody waits in front of the screen for longer than this: people have turned to something else,
/// and want to be told. What is shorter they see the end of.
inline constexpr std::chrono::seconds longSync{60};

enum class Brought { Nothing, Songs };

/// A sync that has just ended.
struct EndedSync {
    bool success = false;
    Brought brought = Brought::Nothing;
    Clock::TimePoint::duration duration = {};
};

/// What happens around the engine at one moment.
struct NoticeOccasion {
    /// Nothing where none has ended since the last occasion.
    std::optional<EndedSync> ended = {};
    /// By the sync that is under way.
    Brought brought = Brought::Nothing;
    /// False while a person sees on the screen how the engine does, or wants no notices.
    bool mayShow = true;
};

/// What a person knows, and need not be told again.
struct NoticeMemory {
    /// As long as it is so. Also where it was not shown because it was on the screen.
    std::optional<DesktopNotice> told = {};
    bool isShown = false;
    /// Of the last result that was looked at.
    std::uint64_t lastTime = 0;

    bool operator==(const NoticeMemory&) const = default;
};

/// The memory after an occasion.
/// @param now what the engine tells its clients.
[[nodiscard]] NoticeMemory recall(NoticeMemory before, const engine::EngineStatus& now,
                                  const NoticeOccasion& occasion);

/// What is to be on the desktop; nothing for no notice.
[[nodiscard]] std::optional<DesktopNotice> shownBy(const NoticeMemory& memory);

} // namespace quorl::syncd
