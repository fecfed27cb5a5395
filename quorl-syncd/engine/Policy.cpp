#include "quorl-syncd/engine/Policy.h"

#include <algorithm>
#include <array>
#include <string>
#include <string_view>
#include <utility>

#include "services/engine/Codes.h"
#include "services/engine/Names.h"

namespace quorl::syncd {

namespace {

using wearable::Selection;

using engine::Message;

namespace code = engine::code;

struct Obstacle {
    bool (*isThere)(const Situation&);
    /// Null for the message that the situation has.
    const char* code;
};

constexpr const char* problemOfWearable = nullptr;

/// A sync that is under way finds out by itself whether its wearable is still there.
bool isWaitingForAnswer(const Situation& now) { return now.running && now.isWearableLookedFor; }

/// Where a playlist is chosen and in the music folder.
Selection wantedIn(const Situation& now) {
    return {*now.choices.playlist, *now.revision, now.choices.limitType, now.choices.limit};
}

/// A wearable that is not there does not say otherwise.
bool isSent(const Selection& wanted, const Situation& now) {
    return (!now.usage || now.usage->sent == wanted) &&
           now.choices.lastSent == SentPlaylist{wanted.playlist, wanted.revision};
}

/// What was sent needs none any more.
bool isChargerNeeded(const Situation& now) {
    return now.running ? now.running->charger == Charger::Needed
                       : !now.isStartRequested && !isSent(wantedIn(now), now);
}

/// The first one that is there is told; each may rely on those before it.
constexpr std::array obstacles{
    Obstacle{[](const Situation& now) { return !now.choices.isSyncEnabled; }, code::syncOff},
    Obstacle{[](const Situation& now) { return !now.choices.playlist; }, code::noPlaylist},
    Obstacle{[](const Situation& now) { return !now.isMusicRead; }, code::readingMusic},
    Obstacle{[](const Situation& now) { return !now.revision; }, code::playlistGone},
    Obstacle{[](const Situation& now) { return !now.usage && !isWaitingForAnswer(now); },
             problemOfWearable},
    Obstacle{[](const Situation& now) { return !now.attachment.connected; }, code::notConnected},
    Obstacle{[](const Situation& now) { return !now.attachment.onCharger && isChargerNeeded(now); },
             code::notOnCharger},
};

/// Where something was claimed and a wearable is there.
bool hasClaimed(const Situation& now) {
    const auto& sent = now.usage->sent;
    return sent && now.choices.lastSent == SentPlaylist{sent->playlist, sent->revision};
}

bool isDue(const Selection& wanted, const Situation& now) {
    return now.isStartRequested ||
           (now.now >= now.quietFrom && now.givenUp != wanted && !isSent(wanted, now));
}

Message upToDate(std::uint64_t leftOut) {
    return leftOut == 0 ? Message{code::upToDate}
                        : Message{code::upToDateBut, {std::to_string(leftOut)}};
}

/// Another revision of the playlist has its turn afterwards.
bool isRunning(Selection wanted, const Situation& now) {
    wanted.revision = now.running->selection.revision;
    return now.running->selection == wanted && now.running->wearable == now.wearable;
}

/// A wearable that is there is all that it takes.
bool isRemovable(const Situation& now) { return now.usage && now.attachment.connected; }

/// Where it does not go on.
Message whyRemovalEnds(const Situation& now) {
    if (now.running->selection != Selection()) {
        return {code::syncOff};
    }
    if (!now.usage) {
        return now.wearableProblem;
    }
    return {now.attachment.connected ? code::somethingElseChosen : code::notConnected};
}

Decision decideRemoval(const Situation& now) {
    using Kind = Decision::Kind;
    if (!now.running) {
        return isRemovable(now) ? Decision{Kind::Begin, {}, {}} : Decision();
    }
    const bool goesOn = now.running->selection == Selection() &&
                        now.running->wearable == now.wearable &&
                        (isRemovable(now) || isWaitingForAnswer(now));
    return goesOn ? Decision{Kind::Continue, {}, {}}
                  : Decision{Kind::Stop, {}, whyRemovalEnds(now)};
}

/// A sync that is to end is under way until its device has answered.
Message statusOf(const Situation::Running& running) {
    if (running.whyStopped) {
        return {code::stopping, engine::flat(*running.whyStopped)};
    }
    return {running.selection == Selection() ? code::removing : code::syncing};
}

} // namespace

std::optional<Message> obstacleIn(const Situation& situation) {
    const auto* const found = std::ranges::find_if(
        obstacles, [&](const Obstacle& obstacle) { return obstacle.isThere(situation); });
    if (found == obstacles.end()) {
        return std::nullopt;
    }
    return found->code == problemOfWearable ? situation.wearableProblem : Message{found->code};
}

Decision decide(const Situation& situation) {
    using Kind = Decision::Kind;
    if (situation.isRemovalRequested) {
        return decideRemoval(situation);
    }
    if (auto obstacle = obstacleIn(situation)) {
        return {situation.running ? Kind::Stop : Kind::Rest, {}, std::move(*obstacle)};
    }
    const auto wanted = wantedIn(situation);
    if (situation.running) {
        return isRunning(wanted, situation) ? Decision{Kind::Continue, {}, {}}
                                            : Decision{Kind::Stop, {}, {code::somethingElseChosen}};
    }
    return isDue(wanted, situation) ? Decision{Kind::Begin, wanted, {}} : Decision();
}

bool isClaimToBeForgotten(const Situation& situation, const Decision& decision) {
    if (decision.kind == Decision::Kind::Begin) {
        return true; // also where all was sent: somebody may have asked because it is not there
    }
    return situation.choices.lastSent && situation.usage && !hasClaimed(situation);
}

Message statusOf(const Situation& situation, const Message& last) {
    if (situation.running) {
        return statusOf(*situation.running);
    }
    if (auto obstacle = obstacleIn(situation)) {
        return std::move(*obstacle);
    }
    const auto wanted = wantedIn(situation);
    if (isSent(wanted, situation)) {
        return upToDate(situation.leftOutCount);
    }
    return situation.givenUp == wanted ? last : Message{code::aboutToSync};
}

std::string_view syncStateOf(const Situation& situation) {
    if (!situation.choices.isSyncEnabled || !situation.choices.playlist) {
        return "off";
    }
    if (!situation.isMusicRead) {
        return "unknown";
    }
    if (!situation.revision) {
        return "off";
    }
    if (situation.running) {
        return "syncing";
    }
    if (situation.isWearableLookedFor) {
        return "unknown";
    }
    return isSent(wantedIn(situation), situation) ? "synced" : "pending";
}

Conclusion conclusionOf(const Outcome& outcome, const std::string& rememberProblem,
                        const std::optional<Message>& whyStopped) {
    using Kind = Outcome::Kind;
    const bool isSent = outcome.kind == Kind::Sent;
    if (isSent && rememberProblem.empty()) {
        return {true, outcome.message, false, false};
    }
    if (outcome.kind == Kind::Stopped) {
        return {false, whyStopped.value_or(outcome.message), false, false};
    }
    // Whoever has cancelled it has given it up, and may have taken that back since.
    const bool isCancelled = whyStopped && whyStopped->code == code::cancelled;
    return {false, isSent ? engine::other(rememberProblem) : outcome.message, !isCancelled,
            !isCancelled && (isSent || outcome.mayPass)};
}

} // namespace quorl::syncd
