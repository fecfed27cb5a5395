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
         << decision.sentence << '"';
}

void PrintTo(const Conclusion& conclusion, std::ostream* out) {
    *out << (conclusion.success ? "success" : "failure") << " \"" << conclusion.message << '"'
         << (conclusion.isGivenUp ? ", given up" : "")
         << (conclusion.isTriedAgain ? ", tried again" : "");
}

namespace {

using namespace std::chrono_literals;
using Kind = Decision::Kind;

constexpr wearable::Selection wanted{7, 3, 1, 250};
constexpr wearable::Selection older{7, 2, 1, 250};
constexpr wearable::Selection other{8, 3, 1, 250};

const auto offMessage = "Music sync is switched off.";
const auto noPlaylistMessage = "No playlist is chosen.";
const auto readingMessage = "Reading the music folder…";
const auto goneMessage = "The chosen playlist is not in the music folder.";
const auto awayMessage = "The Velora at /media/velora cannot be reached.";
const auto disconnectedMessage = "The wearable is not connected.";
const auto chargerMessage = "The wearable is not on its charger.";
const auto otherMessage = "Something else was chosen.";

/// Playlist 7 is chosen and there, and so is the wearable, which has never got anything.
Situation readyToBegin() {
    Situation now;
    now.choices = {true, 7, 1, 250, {}};
    now.isMusicRead = true;
    now.revision = 3;
    now.wearable = {"/media/velora", {}, false};
    now.usage = wearable::Usage();
    now.wearableProblem = awayMessage;
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

Decision waits(const std::string& obstacle) { return {Kind::Rest, {}, obstacle}; }

Decision stops(const std::string& why) { return {Kind::Stop, {}, why}; }

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
    ::testing::Values(
        Case{"off", {switchOff}, waits(offMessage)},
        Case{"nothing chosen", {chooseNothing, losePlaylist}, waits(noPlaylistMessage)},
        Case{"music not read", {read, losePlaylist}, waits(readingMessage)},
        Case{"playlist gone", {losePlaylist}, waits(goneMessage)},
        Case{"wearable away", {loseWearable}, waits(awayMessage)},
        Case{"wearable perhaps another one", {lookForWearable}, waits(awayMessage)},
        Case{"not connected", {disconnect}, waits(disconnectedMessage)},
        Case{"not on charger", {takeOffCharger}, waits(chargerMessage)}));

INSTANTIATE_TEST_SUITE_P(
    FirstOfTwoObstacles, Decides,
    ::testing::Values(
        Case{"off", {switchOff, chooseNothing}, waits(offMessage)},
        Case{"nothing chosen", {chooseNothing, read}, waits(noPlaylistMessage)},
        Case{"music not read", {read, losePlaylist}, waits(readingMessage)},
        Case{"playlist gone", {losePlaylist, loseWearable}, waits(goneMessage)},
        Case{"wearable away", {loseWearable, disconnect}, waits(awayMessage)},
        Case{"not connected", {disconnect, takeOffCharger}, waits(disconnectedMessage)}));

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
                      Case{"not connected", {disconnect, request}, waits(disconnectedMessage)}));

INSTANTIATE_TEST_SUITE_P(
    Running, Decides,
    ::testing::Values(
        Case{"nothing new", {run}, continues}, Case{"all was sent before", {run, send}, continues},
        Case{"cancelled and not ended yet", {run, giveUp}, continues},
        Case{"preferences still change", {run, chooseJustNow}, continues},
        Case{"another revision waits", {runAnOlderRevision}, continues},
        Case{"switched off", {run, switchOff}, stops(offMessage)},
        Case{"playlist gone", {run, losePlaylist}, stops(goneMessage)},
        Case{"wearable away", {run, loseWearable}, stops(awayMessage)},
        Case{"wearable perhaps another one", {run, lookForWearable}, continues},
        Case{"not connected", {run, disconnect}, stops(disconnectedMessage)},
        Case{"taken off the charger", {run, takeOffCharger}, stops(chargerMessage)},
        Case{"begun without a charger", {runIgnoringCharger, takeOffCharger}, continues},
        Case{"a request does not excuse the one that runs",
             {run, takeOffCharger, request},
             stops(chargerMessage)},
        Case{"another playlist", {runAnotherPlaylist}, stops(otherMessage)},
        Case{"another limit", {runWithAnotherLimit}, stops(otherMessage)},
        Case{"another wearable", {runToAnotherWearable}, stops(otherMessage)},
        Case{"an obstacle is told before another choice",
             {runAnotherPlaylist, disconnect},
             stops(disconnectedMessage)}));

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
        return statusOf(now, "The last message.");
    };

    EXPECT_EQ(statusWith({send}), "Everything is up to date.");
    EXPECT_EQ(statusWith({send, giveUp}), "Everything is up to date.");
    EXPECT_EQ(statusWith({giveUp}), "The last message.");
    EXPECT_EQ(statusWith({giveUpOlder}), "About to sync music.");
    EXPECT_EQ(statusWith({chooseJustNow}), "About to sync music.");
    EXPECT_EQ(statusWith({sendWithAnotherLimit, chooseJustNow}), "About to sync music.");
    EXPECT_EQ(statusWith({disconnect}), disconnectedMessage);
    EXPECT_EQ(statusWith({giveUp, disconnect}), disconnectedMessage);
    EXPECT_EQ(statusWith({run}), "Syncing music.");
    EXPECT_EQ(statusWith({run, disconnect}), disconnectedMessage) << "it is being stopped";
    EXPECT_EQ(statusWith({run, lookForWearable}), "Syncing music.");
}

TEST(Conclusions, FollowFromHowASyncEndedAndWhetherThatCouldBeRemembered) {
    using End = Outcome::Kind;
    const Outcome sent{End::Sent, "3 songs synced.", false, false};
    const Outcome stopped{End::Stopped, "The sync was stopped.", false, false};
    const Outcome full{End::Failed, "It is full.", false, true};
    const Outcome changed{End::Failed, "A song has changed.", true, false};

    EXPECT_EQ(conclusionOf(sent, "", ""), (Conclusion{true, "3 songs synced.", false, false}));
    EXPECT_EQ(conclusionOf(sent, "", "Something else was chosen."),
              (Conclusion{true, "3 songs synced.", false, false}))
        << "it came too late";
    EXPECT_EQ(conclusionOf(sent, "No store.", ""), (Conclusion{false, "No store.", true, true}));
    EXPECT_EQ(conclusionOf(sent, "No store.", "Cancelled."),
              (Conclusion{false, "No store.", true, false}));
    EXPECT_EQ(conclusionOf(stopped, "", "Cancelled."),
              (Conclusion{false, "Cancelled.", false, false}));
    EXPECT_EQ(conclusionOf(full, "", ""), (Conclusion{false, "It is full.", true, true}));
    EXPECT_EQ(conclusionOf(full, "", "Cancelled."),
              (Conclusion{false, "It is full.", true, false}));
    EXPECT_EQ(conclusionOf(changed, "", ""),
              (Conclusion{false, "A song has changed.", true, false}));
}

} // namespace

} // namespace quorl::syncd
