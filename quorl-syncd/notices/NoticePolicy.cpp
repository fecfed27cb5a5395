#include "quorl-syncd/notices/NoticePolicy.h"

#include <algorithm>
#include <array>
#include <string_view>
#include <utility>

#include "services/engine/Codes.h"
#include "services/engine/Names.h"
#include "services/wearable/Unseen.h"

namespace quorl::syncd {

namespace {

using Kind = DesktopNotice::Kind;

using engine::Message;

namespace code = engine::code;

/// What a person can mend; the others pass by themselves, or were wished for.
struct Cause {
    std::string_view code;
    /// A sync that brings songs shows that it is gone, and need not end for that.
    enum class Ends { WithAResult, WithASong } ends = Ends::WithAResult;
};

constexpr std::array causes{
    Cause{code::wearableFull},
    Cause{code::notEnoughSpace},
    Cause{code::writeProtected},
    Cause{code::obstructed},
    Cause{code::notEnoughMemory},
    Cause{wearable::unseen::badManifest},
    Cause{code::songUnreadable},
    Cause{code::songTooLarge},
    Cause{code::wentAway, Cause::Ends::WithASong},
    Cause{code::notConnected, Cause::Ends::WithASong},
    Cause{code::other, Cause::Ends::WithASong}, // of the wearable, or of the settings
};

std::string at(const Message& message, std::size_t place) {
    return place < message.arguments.size() ? message.arguments[place] : std::string();
}

/// Of several songs, what is the matter with the first one.
std::string causeOf(const Message& message) {
    return message.code == code::songsLeftOut ? at(message, 1) : message.code;
}

/// Figures differ from one try to the next, and the system's words do.
bool isSameCause(const Message& one, const Message& other) {
    const bool isAboutSong = one.code == code::songsLeftOut;
    return one.code == other.code && causeOf(one) == causeOf(other) &&
           (!isAboutSong || at(one, 2) == at(other, 2));
}

/// Null for what nobody can mend.
const Cause* mendable(const Message& message) {
    const auto* const found = std::ranges::find(causes, causeOf(message), &Cause::code);
    return found == causes.end() ? nullptr : found;
}

Message lastIn(const engine::EngineStatus& status) {
    return {status.lastCode, status.lastArguments};
}

/// Nothing where it is not worth telling.
std::optional<DesktopNotice> noticeOf(const EndedSync& sync, const Message& result) {
    if (!sync.success) {
        return mendable(result) ? std::optional(DesktopNotice{Kind::Failed, result}) : std::nullopt;
    }
    const bool isWorth = sync.brought == Brought::Songs && sync.duration >= longSync;
    return isWorth ? std::optional(DesktopNotice{Kind::Done, result}) : std::nullopt;
}

bool isStillSo(const DesktopNotice& told, const engine::EngineStatus& now, Brought brought) {
    if (now.syncState == engine::syncOff || !isSameCause(told.message, lastIn(now))) {
        return false;
    }
    if (told.kind == Kind::Done) {
        return now.syncState != engine::syncSyncing;
    }
    const auto* const cause = mendable(told.message);
    return brought == Brought::Nothing || cause->ends == Cause::Ends::WithAResult;
}

bool isNews(const NoticeMemory& before, const DesktopNotice& notice) {
    return !before.told || before.told->kind != notice.kind ||
           !isSameCause(before.told->message, notice.message);
}

} // namespace

NoticeMemory recall(NoticeMemory before, const engine::EngineStatus& now,
                    const NoticeOccasion& occasion) {
    // A sync that ended with another wearable has another result than this.
    const bool isItsResult = occasion.ended && now.lastTime != before.lastTime;
    const auto notice = isItsResult ? noticeOf(*occasion.ended, lastIn(now)) : std::nullopt;
    auto memory = std::move(before);
    if (notice && isNews(memory, *notice)) {
        memory.told = notice;
        memory.isShown = true;
    }
    if (memory.told && !isStillSo(*memory.told, now, occasion.brought)) {
        memory.told.reset();
    }
    memory.isShown = memory.isShown && memory.told && occasion.mayShow;
    memory.lastTime = now.lastTime;
    return memory;
}

std::optional<DesktopNotice> shownBy(const NoticeMemory& memory) {
    return memory.isShown ? memory.told : std::nullopt;
}

} // namespace quorl::syncd
