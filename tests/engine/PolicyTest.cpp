// What the engine decides, whatever the situation is.

#include "quorl-syncd/engine/Policy.h"

#include <functional>
#include <ostream>

#include <gtest/gtest.h>

namespace quorl::syncd {

void PrintTo(const Decision& decision, std::ostream* out) {
    constexpr std::array names{"Rest", "Begin", "Continue", "Stop"};
    *out << names.at(static_cast<std::size_t>(decision.kind)) << " playlist "
         << decision.selection.playlist << " revision " << decision.selection.revision << ": \""
         << engine::sentence(decision.message) << '"';
}

void PrintTo(const Conclusion& conclusion, std::ostream* out) {
    *out << (conclusion.success ? "success" : "failure") << " \""
         << engine::sentence(conclusion.message) << '"'
         << (conclusion.isGivenUp ? ", given up" : "")
         << (conclusion.isTriedAgain ? ", tried again" : "");
}

namespace {

using namespace std::chrono_literals;
using engine::Message;
using Kind = Decision::Kind;

constexpr wearable::Selection wanted{7, 3, 1, 250};
constexpr wearable::Selection older{7, 2, 1, 250};
constexpr wearable::Selection other{8, 3, 1, 250};

const Message off{"sync-off"};
const Message noPlaylist{"no-playlist"};
const Message reading{"reading-music"};
const Message gone{"playlist-gone"};
const Message away = engine::other("The Velora at /media/velora cannot be reached.");
const Message disconnected{"not-connected"};
const Message notOnCharger{"not-on-charger"};
const Message otherChosen{"something-else-chosen"};

/// Playlist 7 is chosen and there, and so is the wearable, which has never got anything.
Situation readyToBegin() {
    Situation now;
    now.choices = {true, 7, 1, 250, {}};
    now.isMusicRead = true;
    now.revision = 3;
    now.wearable = {"/media/velora", {}, false};
    now.usage = wearable::Usage();
    now.wearableProblem = away;
    now.now = Clock::TimePoint(10s);
    return now;
}

using Change = std::function<void(Situation&)>;

void switchOff(Situation& now) { now.choices.isSyncEnabled = false; }

void chooseNothing(Situation& now) { now.choices.playlist.reset(); }

void read(Situation& now) { now.isMusicRead = false; }

void losePlaylist(Situation& now) { now.revision.reset(); }

void loseWearable(Situation& now) { now.usage.reset(); }

void lookForWearable(Situation& now) {
    now.usage.reset();
    now.isWearableLookedFor = true;
}

void disconnect(Situation& now) { now.attachment.connected = false; }

void takeOffCharger(Situation& now) { now.attachment.onCharger = false; }

void run(Situation& now) { now.running = {wanted, now.wearable, Charger::Needed}; }

void runIgnoringCharger(Situation& now) { now.running = {wanted, now.wearable, Charger::Ignored}; }

void send(Situation& now) {
    now.usage->sent = wanted;
    now.choices.lastSent = SentPlaylist{7, 3};
}

void cancel(Situation& now) { now.running->whyStopped = Message{"cancelled"}; }

void leaveOut(Situation& now) { now.leftOutCount = 3; }

void giveUp(Situation& now) { now.givenUp = wanted; }

void giveUpOlder(Situation& now) { now.givenUp = older; }

void request(Situation& now) { now.isStartRequested = true; }

void chooseJustNow(Situation& now) { now.quietFrom = now.now + 1ms; }

void chooseAWhileAgo(Situation& now) { now.quietFrom = now.now; }

struct Case {
    const char* name;
    std::vector<void (*)(Situation&)> changes;
    Decision expected;
};

void PrintTo(const Case& each, std::ostream* out) { *out << each.name; }

class Decides : public ::testing::TestWithParam<Case> {};

TEST_P(Decides, AsItsTableSays) {
    auto now = readyToBegin();
    for (const auto& change : GetParam().changes) {
        change(now);
    }
    EXPECT_EQ(decide(now), GetParam().expected);
}

const Decision begins{Kind::Begin, wanted, {}};
const Decision rests{Kind::Rest, {}, {}};
const Decision continues{Kind::Continue, {}, {}};

Decision waits(const Message& obstacle) { return {Kind::Rest, {}, obstacle}; }

Decision stops(const Message& why) { return {Kind::Stop, {}, why}; }

void sendAnotherRevision(Situation& now) {
    send(now);
    now.revision = 4;
}

void sendWithAnotherLimit(Situation& now) {
    send(now);
    now.usage->sent->limit = 100;
}

void sendFromElsewhere(Situation& now) { now.usage->sent = wanted; }

void rememberOnly(Situation& now) { now.choices.lastSent = SentPlaylist{7, 3}; }

void runAnotherPlaylist(Situation& now) { now.running = {other, now.wearable, Charger::Needed}; }

void runAnOlderRevision(Situation& now) { now.running = {older, now.wearable, Charger::Needed}; }

void runWithAnotherLimit(Situation& now) {
    run(now);
    now.running->selection.limit = 100;
}

void runToAnotherWearable(Situation& now) {
    run(now);
    now.running->wearable.root = "/media/other";
}

const Decision beginsNewRevision{Kind::Begin, {7, 4, 1, 250}, {}};

INSTANTIATE_TEST_SUITE_P(
    Obstacle, Decides,
    ::testing::Values(Case{"off", {switchOff}, waits(off)},
                      Case{"nothing chosen", {chooseNothing, losePlaylist}, waits(noPlaylist)},
                      Case{"music not read", {read, losePlaylist}, waits(reading)},
                      Case{"playlist gone", {losePlaylist}, waits(gone)},
                      Case{"wearable away", {loseWearable}, waits(away)},
                      Case{"wearable perhaps another one", {lookForWearable}, waits(away)},
                      Case{"not connected", {disconnect}, waits(disconnected)},
                      Case{"not on charger", {takeOffCharger}, waits(notOnCharger)}));

INSTANTIATE_TEST_SUITE_P(
    FirstOfTwoObstacles, Decides,
    ::testing::Values(Case{"off", {switchOff, chooseNothing}, waits(off)},
                      Case{"nothing chosen", {chooseNothing, read}, waits(noPlaylist)},
                      Case{"music not read", {read, losePlaylist}, waits(reading)},
                      Case{"playlist gone", {losePlaylist, loseWearable}, waits(gone)},
                      Case{"wearable away", {loseWearable, disconnect}, waits(away)},
                      Case{"not connected", {disconnect, takeOffCharger}, waits(disconnected)}));

INSTANTIATE_TEST_SUITE_P(
    Begin, Decides,
    ::testing::Values(
        Case{"nothing was ever sent", {}, begins}, Case{"all was sent", {send}, rests},
        Case{"another revision was sent", {sendAnotherRevision}, beginsNewRevision},
        Case{"another limit was sent", {sendWithAnotherLimit}, begins},
        Case{"the wearable has it, and nobody has remembered", {sendFromElsewhere}, begins},
        Case{"it was remembered, and the wearable has it not", {rememberOnly}, begins},
        Case{"preferences still change", {chooseJustNow}, rests},
        Case{"preferences do not change any more", {chooseAWhileAgo}, begins},
        Case{"given up", {giveUp}, rests},
        Case{"something else was given up", {giveUpOlder}, begins}));

INSTANTIATE_TEST_SUITE_P(
    StartRequested, Decides,
    ::testing::Values(Case{"all was sent", {send, request}, begins},
                      Case{"given up", {giveUp, request}, begins},
                      Case{"preferences still change", {chooseJustNow, request}, begins},
                      Case{"not on charger", {takeOffCharger, request}, begins},
                      Case{"not connected", {disconnect, request}, waits(disconnected)}));

INSTANTIATE_TEST_SUITE_P(
    Running, Decides,
    ::testing::Values(
        Case{"nothing new", {run}, continues}, Case{"all was sent before", {run, send}, continues},
        Case{"cancelled and not ended yet", {run, giveUp}, continues},
        Case{"preferences still change", {run, chooseJustNow}, continues},
        Case{"another revision waits", {runAnOlderRevision}, continues},
        Case{"switched off", {run, switchOff}, stops(off)},
        Case{"playlist gone", {run, losePlaylist}, stops(gone)},
        Case{"wearable away", {run, loseWearable}, stops(away)},
        Case{"wearable perhaps another one", {run, lookForWearable}, continues},
        Case{"not connected", {run, disconnect}, stops(disconnected)},
        Case{"taken off the charger", {run, takeOffCharger}, stops(notOnCharger)},
        Case{"begun without a charger", {runIgnoringCharger, takeOffCharger}, continues},
        Case{"a request does not excuse the one that runs",
             {run, takeOffCharger, request},
             stops(notOnCharger)},
        Case{"another playlist", {runAnotherPlaylist}, stops(otherChosen)},
        Case{"another limit", {runWithAnotherLimit}, stops(otherChosen)},
        Case{"another wearable", {runToAnotherWearable}, stops(otherChosen)},
        Case{"an obstacle is told before another choice",
             {runAnotherPlaylist, disconnect},
             stops(disconnected)}));

void requestRemoval(Situation& now) {
    switchOff(now);
    now.isRemovalRequested = true;
}

void remove(Situation& now) {
    requestRemoval(now);
    now.running = {{}, now.wearable, Charger::Ignored};
}

void removeFromAnotherWearable(Situation& now) {
    remove(now);
    now.running->wearable.root = "/media/other";
}

const Decision beginsRemoval{Kind::Begin, {}, {}};

INSTANTIATE_TEST_SUITE_P(
    RemovalRequested, Decides,
    ::testing::Values(
        Case{"nothing runs", {requestRemoval}, beginsRemoval},
        Case{"not on charger", {requestRemoval, takeOffCharger}, beginsRemoval},
        Case{"wearable away", {requestRemoval, loseWearable}, rests},
        Case{"wearable perhaps another one", {requestRemoval, lookForWearable}, rests},
        Case{"not connected", {requestRemoval, disconnect}, rests},
        Case{"a sync runs", {run, requestRemoval}, stops(off)},
        Case{"a sync runs, and the wearable is away",
             {run, requestRemoval, loseWearable},
             stops(off)},
        Case{"it runs", {remove}, continues},
        Case{"it runs, wearable perhaps another one", {remove, lookForWearable}, continues},
        Case{"it runs, wearable away", {remove, loseWearable}, stops(away)},
        Case{"it runs, not connected", {remove, disconnect}, stops(disconnected)},
        Case{"it runs on another wearable", {removeFromAnotherWearable}, stops(otherChosen)}));

struct ClaimCase {
    const char* name;
    std::vector<void (*)(Situation&)> changes;
    bool isForgotten;
};

void PrintTo(const ClaimCase& each, std::ostream* out) { *out << each.name; }

class Claim : public ::testing::TestWithParam<ClaimCase> {};

TEST_P(Claim, IsForgottenWhereTheWearableDoesNotOrWillNotHaveIt) {
    auto now = readyToBegin();
    for (const auto& change : GetParam().changes) {
        change(now);
    }
    EXPECT_EQ(isClaimToBeForgotten(now, decide(now)), GetParam().isForgotten);
}

INSTANTIATE_TEST_SUITE_P(
    Sent, Claim,
    ::testing::Values(
        ClaimCase{"a sync begins", {}, true},
        ClaimCase{"a sync begins that changes what was sent", {sendAnotherRevision}, true},
        ClaimCase{"a sync begins to another limit", {sendWithAnotherLimit}, true},
        ClaimCase{"all was sent", {send}, false},
        ClaimCase{"all was sent, and is asked for again", {send, request}, true},
        ClaimCase{"the wearable lost it", {rememberOnly}, true},
        ClaimCase{"the wearable lost it, and nothing is chosen", {rememberOnly, switchOff}, true},
        ClaimCase{
            "the wearable lost it, and preferences change", {rememberOnly, chooseJustNow}, true},
        ClaimCase{"the wearable is away", {rememberOnly, loseWearable}, false},
        ClaimCase{"the wearable has it, and nothing is chosen", {send, switchOff}, false},
        ClaimCase{"nothing was sent, and nothing is chosen", {switchOff}, false},
        ClaimCase{"a sync is under way that has all", {send, run}, false}));

TEST(Status, TellsWhatIsDoneOrWhatIsWaitedFor) {
    const auto statusWith = [](const std::vector<void (*)(Situation&)>& changes) {
        auto now = readyToBegin();
        for (const auto& change : changes) {
            change(now);
        }
        return statusOf(now, {"last"});
    };

    EXPECT_EQ(statusWith({send}), Message{"up-to-date"});
    EXPECT_EQ(statusWith({send, giveUp}), Message{"up-to-date"});
    EXPECT_EQ(statusWith({giveUp}), Message{"last"});
    EXPECT_EQ(statusWith({giveUpOlder}), Message{"about-to-sync"});
    EXPECT_EQ(statusWith({chooseJustNow}), Message{"about-to-sync"});
    EXPECT_EQ(statusWith({sendWithAnotherLimit, chooseJustNow}), Message{"about-to-sync"});
    EXPECT_EQ(statusWith({disconnect}), disconnected);
    EXPECT_EQ(statusWith({giveUp, disconnect}), disconnected);
    EXPECT_EQ(statusWith({run}), Message{"syncing"});
    EXPECT_EQ(statusWith({run, lookForWearable}), Message{"syncing"});
    EXPECT_EQ(statusWith({run, cancel}), (Message{"stopping", {"cancelled"}}));
    EXPECT_EQ(statusWith({runIgnoringCharger, takeOffCharger}), Message{"syncing"});
    EXPECT_EQ(statusWith({send, takeOffCharger}), Message{"up-to-date"}) << "it waits for nothing";
    EXPECT_EQ(statusWith({sendWithAnotherLimit, takeOffCharger}), notOnCharger);
    EXPECT_EQ(statusWith({send, leaveOut}), (Message{"up-to-date-but", {"3"}}));
}

const std::vector<void (*)(Situation&)> everything{
    switchOff,  chooseNothing,  read,    losePlaylist,       loseWearable, lookForWearable,
    disconnect, takeOffCharger, run,     runIgnoringCharger, send,         giveUp,
    request,    chooseJustNow,  leaveOut};

/// The engine ends what is to end before it tells anything.
void stopWhatIsToEnd(Situation& now) {
    const auto decision = decide(now);
    if (decision.kind == Kind::Stop) {
        now.running->whyStopped = decision.message;
    }
}

bool areOneStory(const Situation& now) {
    const auto code = statusOf(now, {"last"}).code;
    const auto state = syncStateOf(now);
    const bool isBusy = code == "syncing" || code == "stopping";
    const bool isUpToDate = code.starts_with("up-to-date");
    const bool isToCome = code == "about-to-sync" || code == "last" || code == "not-on-charger";
    return isBusy == now.running.has_value() && (state != "syncing" || isBusy) &&
           (code != "syncing" || state == "syncing") && (!isUpToDate || state == "synced") &&
           (state != "synced" || !isToCome) && (!isToCome || state == "pending") &&
           (state != "pending" || !isUpToDate) && (now.choices.isSyncEnabled || state == "off");
}

TEST(Status, TellsTheSameStoryAsTheSyncStateWhateverHappens) {
    for (unsigned chosen = 0; chosen < 1U << everything.size(); ++chosen) {
        auto now = readyToBegin();
        for (std::size_t at = everything.size(); at-- > 0;) { // what needs a wearable comes first
            if ((chosen >> at & 1U) != 0) {
                everything[at](now);
            }
        }
        stopWhatIsToEnd(now);
        ASSERT_TRUE(areOneStory(now)) << chosen << ": " << syncStateOf(now) << ", "
                                      << engine::sentence(statusOf(now, {"last"}));
    }
}

TEST(Conclusions, FollowFromHowASyncEndedAndWhetherThatCouldBeRemembered) {
    using End = Outcome::Kind;
    const Message all{"synced", {"3"}};
    const Message full{"wearable-full"};
    const Message changed{"song-changed"};
    const Message cancelled{"cancelled"};
    const Outcome sent{End::Sent, all, false, false};
    const Outcome stopped{End::Stopped, {"stopped"}, false, false};
    const Outcome failed{End::Failed, full, false, true};
    const Outcome left{End::Failed, changed, true, false};

    EXPECT_EQ(conclusionOf(sent, "", {}), (Conclusion{true, all, false, false}));
    EXPECT_EQ(conclusionOf(sent, "", otherChosen), (Conclusion{true, all, false, false}))
        << "it came too late";
    EXPECT_EQ(conclusionOf(sent, "No store.", {}),
              (Conclusion{false, engine::other("No store."), true, true}));
    EXPECT_EQ(conclusionOf(sent, "No store.", cancelled),
              (Conclusion{false, engine::other("No store."), false, false}));
    EXPECT_EQ(conclusionOf(stopped, "", cancelled), (Conclusion{false, cancelled, false, false}));
    EXPECT_EQ(conclusionOf(failed, "", {}), (Conclusion{false, full, true, true}));
    EXPECT_EQ(conclusionOf(failed, "", cancelled), (Conclusion{false, full, false, false}));
    EXPECT_EQ(conclusionOf(failed, "", otherChosen), (Conclusion{false, full, true, true}))
        << "the other may have been taken back by then";
    EXPECT_EQ(conclusionOf(left, "", {}), (Conclusion{false, changed, true, false}));
}

} // namespace

} // namespace quorl::syncd
