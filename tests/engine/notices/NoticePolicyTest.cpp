// What a person is told on the desktop, and what not.

#include "quorl-syncd/notices/NoticePolicy.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "services/engine/Codes.h"
#include "services/engine/Names.h"

namespace {

using namespace quorl::syncd;
using namespace std::chrono_literals;
using quorl::engine::EngineStatus;
using quorl::engine::Message;
using Kind = DesktopNotice::Kind;

namespace code = quorl::engine::code;
namespace engine = quorl::engine;

constexpr std::uint64_t resultTime = 5;

EngineStatus statusWith(const Message& last, const char* syncState = engine::syncPending) {
    return {.syncState = syncState,
            .lastCode = last.code,
            .lastArguments = last.arguments,
            .lastTime = resultTime};
}

/// The notice after a sync that has ended so, where there was none before.
std::optional<DesktopNotice> shownAfter(const EndedSync& sync, const EngineStatus& now) {
    return shownBy(recall({}, now, {.ended = sync}));
}

/// A sync that has failed because of this was told, and shown.
NoticeMemory toldOf(const Message& cause) {
    return {DesktopNotice{Kind::Failed, cause}, true, resultTime - 1};
}

const EndedSync failed{};
const Message full{code::wearableFull, {}};

struct ResultCase {
    const char* name;
    EndedSync sync;
    Message result;
    std::optional<Kind> shown;
};

class Result : public ::testing::TestWithParam<ResultCase> {};

TEST_P(Result, IsToldWhereItIsWorthIt) {
    const auto& [name, sync, result, shown] = GetParam();
    const auto state = sync.success ? engine::syncSynced : engine::syncPending;
    const auto expected = shown ? std::optional(DesktopNotice{*shown, result}) : std::nullopt;
    EXPECT_EQ(shownAfter(sync, statusWith(result, state)), expected);
}

const auto songs = Brought::Songs;
const Message synced{code::synced, {"12"}};

INSTANTIATE_TEST_SUITE_P(
    Kinds, Result,
    ::testing::Values(
        ResultCase{"Long", {true, songs, longSync}, synced, Kind::Done},
        ResultCase{
            "LongWithSongsLeftOut", {true, songs, 1h}, {code::syncedBut, {"12", "1"}}, Kind::Done},
        ResultCase{"Short", {true, songs, longSync - 1ms}, synced, {}},
        ResultCase{"NothingToDo", {true, Brought::Nothing, 1h}, synced, {}},
        ResultCase{"Full", {false, songs, 1h}, full, Kind::Failed},
        ResultCase{"FullAtOnce", failed, full, Kind::Failed},
        ResultCase{"NoSpace", failed, {code::notEnoughSpace, {"2", "1"}}, Kind::Failed},
        ResultCase{"Protected", failed, {code::writeProtected, {"no"}}, Kind::Failed},
        ResultCase{"Obstructed", failed, {code::obstructed, {}}, Kind::Failed},
        ResultCase{"NoMemory", failed, {code::notEnoughMemory, {}}, Kind::Failed},
        ResultCase{"WentAway", failed, {code::wentAway, {"gone"}}, Kind::Failed},
        ResultCase{"Disconnected", failed, {code::notConnected, {}}, Kind::Failed},
        ResultCase{"Other", failed, {code::other, {"It hangs."}}, Kind::Failed},
        ResultCase{"SongUnreadable",
                   failed,
                   {code::songsLeftOut, {"1", code::songUnreadable, "a.mp3"}},
                   Kind::Failed},
        ResultCase{"SongTooLarge",
                   failed,
                   {code::songsLeftOut, {"1", code::songTooLarge, "a.mp3"}},
                   Kind::Failed},
        ResultCase{
            "SongChanged", failed, {code::songsLeftOut, {"1", code::songChanged, "a.mp3"}}, {}},
        ResultCase{"NoSong", failed, {code::songsLeftOut, {}}, {}},
        ResultCase{"NoCause", failed, {code::songsLeftOut, {"1"}}, {}},
        ResultCase{"OffTheCharger", failed, {code::notOnCharger, {}}, {}},
        ResultCase{"Cancelled", failed, {code::cancelled, {}}, {}},
        ResultCase{"AnotherChoice", failed, {code::somethingElseChosen, {}}, {}},
        ResultCase{"AnotherProgram", failed, {code::anotherProgram, {}}, {}},
        ResultCase{"Unknown", failed, {"weather", {}}, {}}),
    [](const auto& each) { return std::string(each.param.name); });

TEST(Notice, IsForTheResultOfTheSyncThatHasEnded) {
    const NoticeMemory before{.lastTime = resultTime};
    EXPECT_EQ(recall(before, statusWith(full), {.ended = failed}), before);
}

TEST(Notice, IsNotForResultsOfEarlierSyncs) {
    EXPECT_EQ(shownBy(recall({}, statusWith(full), {})), std::nullopt);
}

TEST(Notice, IsNotShownAgainWhenTheSameIsInTheWayOfTheNextSync) {
    auto now = statusWith(full);
    auto memory = recall({}, now, {.ended = failed});
    memory = recall(memory, now, {.mayShow = false});
    ASSERT_EQ(shownBy(memory), std::nullopt);

    ++now.lastTime;
    memory = recall(memory, now, {.ended = failed});

    EXPECT_EQ(shownBy(memory), std::nullopt);
    EXPECT_TRUE(memory.told);
}

TEST(Notice, StaysAsItIsWhereOnlyTheFiguresDiffer) {
    const auto before = toldOf({code::notEnoughSpace, {"20", "10"}});
    const auto now = statusWith({code::notEnoughSpace, {"20", "9"}});
    EXPECT_EQ(shownBy(recall(before, now, {.ended = failed})), before.told);
}

TEST(Notice, GivesWayToAnotherCause) {
    const Message protectedNow{code::writeProtected, {"no"}};
    EXPECT_EQ(shownBy(recall(toldOf(full), statusWith(protectedNow), {.ended = failed})),
              (DesktopNotice{Kind::Failed, protectedNow}));
}

TEST(Notice, GivesWayToAnotherSong) {
    const Message before{code::songsLeftOut, {"1", code::songUnreadable, "a.mp3", "no"}};
    const Message now{code::songsLeftOut, {"1", code::songUnreadable, "b.mp3", "no"}};
    EXPECT_EQ(shownBy(recall(toldOf(before), statusWith(now), {.ended = failed})),
              (DesktopNotice{Kind::Failed, now}));
}

TEST(Notice, OfAFailureIsWithdrawnWhenASyncIsDone) {
    const EndedSync done{true, Brought::Songs, 1s};
    const auto now = statusWith(synced, engine::syncSynced);
    EXPECT_EQ(recall(toldOf(full), now, {.ended = done}), NoticeMemory{.lastTime = resultTime});
}

TEST(Notice, OfAFailureIsReplacedWhenALongSyncIsDone) {
    const EndedSync done{true, Brought::Songs, 1h};
    const auto now = statusWith(synced, engine::syncSynced);
    EXPECT_EQ(shownBy(recall(toldOf(full), now, {.ended = done})),
              (DesktopNotice{Kind::Done, synced}));
}

TEST(Notice, OfAFailureIsWithdrawnWhenNothingIsToBeSynced) {
    EXPECT_EQ(recall(toldOf(full), statusWith(full, engine::syncOff), {}).told, std::nullopt);
}

TEST(Notice, OfAFailureIsWithdrawnWhenAnotherWearableIsChosen) {
    EXPECT_EQ(recall(toldOf(full), statusWith({}), {}).told, std::nullopt);
}

TEST(Notice, OfAFailureStaysWhileItIsTriedAgain) {
    const auto now = statusWith(full, engine::syncSyncing);
    EXPECT_TRUE(shownBy(recall(toldOf(full), now, {.brought = Brought::Songs})));
}

TEST(Notice, OfAWearableThatWentAwayIsWithdrawnOnceItTakesSongsAgain) {
    const Message gone{code::wentAway, {"gone"}};
    const auto now = statusWith(gone, engine::syncSyncing);
    EXPECT_TRUE(shownBy(recall(toldOf(gone), now, {})));
    EXPECT_EQ(recall(toldOf(gone), now, {.brought = Brought::Songs}).told, std::nullopt);
}

TEST(Notice, OfALongSyncIsWithdrawnWhenTheNextOneBegins) {
    const NoticeMemory before{DesktopNotice{Kind::Done, synced}, true, resultTime};
    EXPECT_EQ(shownBy(recall(before, statusWith(synced, engine::syncPending), {})), before.told);
    EXPECT_EQ(recall(before, statusWith(synced, engine::syncSyncing), {}).told, std::nullopt);
}

TEST(Notice, IsNotShownWhileItMayNotBeAndNotAfterwards) {
    auto memory = recall({}, statusWith(full), {.ended = failed, .mayShow = false});
    EXPECT_EQ(shownBy(memory), std::nullopt);
    memory = recall(memory, statusWith(full), {.mayShow = true});
    EXPECT_EQ(shownBy(memory), std::nullopt);
}

} // namespace
