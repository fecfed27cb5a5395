#include "quorl-syncd/engine/Policy.h"

#include <algorithm>
#include <array>
#include <string_view>

namespace quorl::syncd {

namespace {

using wearable::Selection;

struct Obstacle {
    bool (*isThere)(const Situation&);
    std::string_view sentence;
};

/// Stands for the sentence that the situation has.
constexpr std::string_view problemOfWearable;

bool isChargerNeeded(const Situation& now) {
    return now.running ? now.running->charger == Charger::Needed : !now.isStartRequested;
}

/// A sync that is under way finds out by itself whether its wearable is still there.
bool isWaitingForAnswer(const Situation& now) { return now.running && now.isWearableLookedFor; }

/// The first one that is there is told.
constexpr std::array obstacles{
    Obstacle{[](const Situation& now) { return !now.choices.isSyncEnabled; },
             "Music sync is switched off."},
    Obstacle{[](const Situation& now) { return !now.choices.playlist; }, "No playlist is chosen."},
    Obstacle{[](const Situation& now) { return !now.isMusicRead; }, "Reading the music folder…"},
    Obstacle{[](const Situation& now) { return !now.revision; },
             "The chosen playlist is not in the music folder."},
    Obstacle{[](const Situation& now) { return !now.usage && !isWaitingForAnswer(now); },
             problemOfWearable},
    Obstacle{[](const Situation& now) { return !now.attachment.connected; },
             "The wearable is not connected."},
    Obstacle{[](const Situation& now) { return !now.attachment.onCharger && isChargerNeeded(now); },
             "The wearable is not on its charger."},
};

/// Where a playlist is chosen and in the music folder.
Selection wantedIn(const Situation& now) {
    return {*now.choices.playlist, *now.revision, now.choices.limitType, now.choices.limit};
}

/// A wearable that is not there does not say otherwise.
bool isSent(const Selection& wanted, const Situation& now) {
    return (!now.usage || now.usage->sent == wanted) &&
           now.choices.lastSent == SentPlaylist{wanted.playlist, wanted.revision};
}

/// Where something was claimed and a wearable is there.
bool hasClaimed(const Situation& now) {
    const auto& sent = now.usage->sent;
    return sent && now.choices.lastSent == SentPlaylist{sent->playlist, sent->revision};
}

bool isDue(const Selection& wanted, const Situation& now) {
    return now.isStartRequested ||
           (now.now >= now.quietFrom && now.givenUp != wanted && !isSent(wanted, now));
}

/// Another revision of the playlist has its turn afterwards.
bool isRunning(Selection wanted, const Situation& now) {
    wanted.revision = now.running->selection.revision;
    return now.running->selection == wanted && now.running->wearable == now.wearable;
}

} // namespace

std::string obstacleIn(const Situation& situation) {
    const auto* const found = std::ranges::find_if(
        obstacles, [&](const Obstacle& obstacle) { return obstacle.isThere(situation); });
    if (found == obstacles.end()) {
        return {};
    }
    return found->sentence == problemOfWearable ? situation.wearableProblem
                                                : std::string(found->sentence);
}

Decision decide(const Situation& situation) {
    using Kind = Decision::Kind;
    auto obstacle = obstacleIn(situation);
    if (!obstacle.empty()) {
        return {situation.running ? Kind::Stop : Kind::Rest, {}, obstacle};
    }
    const auto wanted = wantedIn(situation);
    if (situation.running) {
        return isRunning(wanted, situation)
                   ? Decision{Kind::Continue, {}, {}}
                   : Decision{Kind::Stop, {}, "Something else was chosen."};
    }
    return isDue(wanted, situation) ? Decision{Kind::Begin, wanted, {}} : Decision();
}

bool isClaimToBeForgotten(const Situation& situation, const Decision& decision) {
    if (decision.kind == Decision::Kind::Begin) {
        return true; // also where all was sent: somebody may have asked because it is not there
    }
    return situation.choices.lastSent && situation.usage && !hasClaimed(situation);
}

std::string statusOf(const Situation& situation, const std::string& lastMessage) {
    auto obstacle = obstacleIn(situation);
    if (!obstacle.empty()) {
        return obstacle;
    }
    if (situation.running) {
        return "Syncing music.";
    }
    const auto wanted = wantedIn(situation);
    if (isSent(wanted, situation)) {
        return "Everything is up to date.";
    }
    return situation.givenUp == wanted ? lastMessage : "About to sync music.";
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
                        const std::string& whyStopped) {
    using Kind = Outcome::Kind;
    const bool isSent = outcome.kind == Kind::Sent;
    if (isSent && rememberProblem.empty()) {
        return {true, outcome.message, false, false};
    }
    if (outcome.kind == Kind::Stopped) {
        return {false, whyStopped, false, false};
    }
    return {false, isSent ? rememberProblem : outcome.message, true,
            whyStopped.empty() && (isSent || outcome.mayPass)};
}

} // namespace quorl::syncd
