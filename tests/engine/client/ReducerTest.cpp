// What a client makes of each thing that the bus may say, in any order.

#include "services/engine/Reducer.h"

#include <limits>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "services/engine/Codes.h"
#include "services/engine/Message.h"
#include "services/engine/Names.h"

namespace {

using namespace quorl::engine;
using Kind = Event::Kind;
using ::testing::IsEmpty;
using ::testing::SizeIs;

const std::string session = "/sessions/1";
const std::string task = "/sessions/1/tasks/1";

sdbus::Variant count(std::uint64_t value) { return sdbus::Variant(value); }

/// A task of the session.
Properties ofTask(Properties more = {}) {
    more["Session"] = sdbus::Variant(sdbus::ObjectPath(session));
    more["GroupingKey"] = sdbus::Variant(std::string("key"));
    return more;
}

/// An engine that has told its objects, and one session with one task among them.
class AnEngine : public ::testing::Test {
  protected:
    AnEngine() {
        hear(
            ObjectsListed{{{sdbus::ObjectPath(enginePath),
                            {{engineInterface, {{"Status", sdbus::Variant(std::string("calm"))}}}}},
                           {sdbus::ObjectPath(session),
                            {{sessionInterface,
                              {{"TypeIdentifier", sdbus::Variant(std::string(deviceSyncType))}}}}},
                           {sdbus::ObjectPath(task), {{taskInterface, ofTask()}}}}});
    }

    /// The kind of what is told; nothing where nothing is.
    std::optional<Kind> hear(const BusMessage& message) {
        const auto reduced = reduce(state_, message);
        state_ = reduced.state;
        event_ = reduced.event;
        EXPECT_TRUE(!event_ || event_->state == state_);
        return event_ ? std::optional(event_->kind) : std::nullopt;
    }

    std::optional<Kind> hearOfTask(Properties properties) {
        return hear(PropertiesChanged{task, taskInterface, std::move(properties)});
    }

    const TaskState& theTask() { return state_->sessions.at(0).tasks.at(0); }

    std::shared_ptr<const EngineState> state_ = std::make_shared<EngineState>();
    std::optional<Event> event_;
};

TEST_F(AnEngine, IsKnownByAllOfItsObjects) {
    ASSERT_TRUE(event_);
    EXPECT_EQ(event_->kind, Kind::EngineDidAppear);
    EXPECT_TRUE(state_->isThere);
    EXPECT_EQ(state_->engine.status, "calm");
    EXPECT_EQ(state_->sessions.at(0).path, session);
    EXPECT_EQ(state_->sessions.at(0).typeIdentifier, deviceSyncType);
    EXPECT_EQ(theTask().path, task);
    EXPECT_EQ(theTask().groupingKey, "key");
}

TEST_F(AnEngine, IsForgottenAsAWholeWhenItIsGone) {
    EXPECT_EQ(hear(EngineGone{"ended"}), Kind::EngineDidVanish);
    EXPECT_EQ(event_->message, "ended");
    EXPECT_EQ(*state_, EngineState());
    EXPECT_EQ(hear(EngineGone{"still"}), Kind::EngineDidVanish);
    EXPECT_EQ(hear(BusGone{"log in"}), Kind::BusDidVanish);
    EXPECT_EQ(event_->message, "log in");
}

TEST_F(AnEngine, ThatIsGoneHasItsLateSignalsPassedOver) {
    hear(EngineGone{"ended"});

    EXPECT_EQ(hear(ObjectAdded{session, {{sessionInterface, {}}}}), std::nullopt);
    EXPECT_EQ(hear(ObjectSignalled{session, sessionInterface, "Completed"}), std::nullopt);
    EXPECT_EQ(hear(PropertiesChanged{
                  enginePath, engineInterface, {{"Status", sdbus::Variant(std::string("late"))}}}),
              std::nullopt);
    EXPECT_EQ(*state_, EngineState());
}

TEST_F(AnEngine, TellsOfANewSessionAndThenOfItsTask) {
    EXPECT_EQ(hear(ObjectAdded{"/sessions/2", {{sessionInterface, {}}}}), Kind::SessionWillBegin);
    EXPECT_EQ(event_->session->path, "/sessions/2");
    EXPECT_EQ(
        hear(ObjectAdded{
            "/sessions/2/tasks/1",
            {{taskInterface, {{"Session", sdbus::Variant(sdbus::ObjectPath("/sessions/2"))}}}}}),
        std::nullopt)
        << "the task tells by itself that it will begin";
    EXPECT_THAT(state_->sessions.at(1).tasks, SizeIs(1));
}

TEST_F(AnEngine, ThatAddsASessionAgainHasItOnce) {
    EXPECT_EQ(
        hear(ObjectAdded{session, {{sessionInterface, {{"Finished", sdbus::Variant(true)}}}}}),
        std::nullopt);
    EXPECT_EQ(hear(ObjectAdded{task, {{taskInterface, ofTask({{"TotalItemCount", count(3)}})}}}),
              std::nullopt);

    ASSERT_THAT(state_->sessions, SizeIs(1));
    EXPECT_TRUE(state_->sessions.at(0).isFinished);
    ASSERT_THAT(state_->sessions.at(0).tasks, SizeIs(1));
    EXPECT_EQ(theTask().totalItemCount, 3);
}

TEST_F(AnEngine, MayHaveATaskOfNoSession) {
    for (const auto& properties :
         {Properties(), Properties{{"Session", sdbus::Variant(sdbus::ObjectPath("/nowhere"))}},
          Properties{{"Session", sdbus::Variant(7)}}}) {
        const auto before = *state_;
        EXPECT_EQ(hear(ObjectAdded{"/lost", {{taskInterface, properties}}}), std::nullopt);
        EXPECT_EQ(*state_, before);
    }
}

TEST_F(AnEngine, TellsOfFiguresButNotOfBeginningAndEndTwice) {
    EXPECT_EQ(hear(ObjectSignalled{task, taskInterface, "WillBegin"}), Kind::TaskWillBegin);
    EXPECT_EQ(hearOfTask({{"Running", sdbus::Variant(true)}, {"TotalItemCount", count(4)}}),
              std::nullopt);
    EXPECT_EQ(hear(ObjectSignalled{task, taskInterface, "DidBegin"}), Kind::TaskDidBegin);
    EXPECT_TRUE(event_->task->isRunning);
    EXPECT_EQ(hearOfTask({{"CompletedItemCount", count(1)}}), Kind::TaskDidUpdate);
    EXPECT_EQ(event_->session->path, session);
    EXPECT_EQ(event_->task->completedItemCount, 1);
    EXPECT_EQ(event_->task->totalItemCount, 4);
    EXPECT_EQ(hearOfTask({{"Running", sdbus::Variant(false)}}), std::nullopt);
    EXPECT_EQ(hear(ObjectSignalled{task, taskInterface, "Completed", true, "Done."}),
              Kind::TaskDidFinish);
    EXPECT_TRUE(event_->success);
    EXPECT_EQ(event_->message, "Done.");
}

TEST_F(AnEngine, EndsASessionWithItsFiguresAndThenTakesItAway) {
    EXPECT_EQ(
        hear(PropertiesChanged{session, sessionInterface, {{"Finished", sdbus::Variant(true)}}}),
        std::nullopt);
    EXPECT_EQ(hear(ObjectSignalled{session, sessionInterface, "Completed", false, "Full."}),
              Kind::SessionDidFinish);
    EXPECT_TRUE(event_->session->isFinished);
    EXPECT_FALSE(event_->success);
    EXPECT_EQ(event_->message, "Full.");
    EXPECT_EQ(hear(ObjectRemoved{task, {taskInterface}}), std::nullopt);
    EXPECT_THAT(state_->sessions.at(0).tasks, IsEmpty());
    EXPECT_EQ(hear(ObjectRemoved{session, {sessionInterface}}), Kind::SessionDidVanish);
    EXPECT_EQ(event_->session->path, session);
    EXPECT_TRUE(event_->session->isFinished) << "as it last was";
    EXPECT_THAT(state_->sessions, IsEmpty());
    EXPECT_EQ(hear(ObjectRemoved{session, {sessionInterface}}), std::nullopt);
}

TEST_F(AnEngine, KeepsASessionThatLosesSomeOtherInterface) {
    EXPECT_EQ(hear(ObjectRemoved{session, {"org.example.Other"}}), std::nullopt);
    EXPECT_EQ(hear(ObjectRemoved{session, {}}), std::nullopt);
    EXPECT_THAT(state_->sessions, SizeIs(1));
}

TEST_F(AnEngine, KeepsATaskThatLosesSomeOtherInterface) {
    EXPECT_EQ(hear(ObjectRemoved{task, {"org.example.Other"}}), std::nullopt);
    EXPECT_EQ(theTask().path, task);
}

TEST_F(AnEngine, MayTellOfWhatIsUnknown) {
    const auto before = *state_;
    for (const auto& message : std::vector<BusMessage>{
             PropertiesChanged{"/unknown", taskInterface, {{"Running", sdbus::Variant(true)}}},
             PropertiesChanged{"/unknown", sessionInterface, {{"Finished", sdbus::Variant(true)}}},
             PropertiesChanged{task, "org.example.Other", {{"Running", sdbus::Variant(true)}}},
             ObjectSignalled{"/unknown", taskInterface, "DidBegin"},
             ObjectSignalled{"/unknown", sessionInterface, "Completed"},
             ObjectSignalled{task, taskInterface, "DidDance"},
             ObjectSignalled{session, sessionInterface, "DidDance"},
             ObjectSignalled{session, "org.example.Other", "Completed"},
             ObjectAdded{"/unknown", {{"org.example.Other", {}}}},
             ObjectRemoved{"/unknown", {taskInterface, sessionInterface}}}) {
        EXPECT_EQ(hear(message), std::nullopt);
        EXPECT_EQ(*state_, before);
    }
}

TEST_F(AnEngine, HasNoProgressOutsideOfNoneAndAll) {
    using Limits = std::numeric_limits<double>;
    for (const auto& [told, taken] :
         std::vector<std::pair<double, double>>{{0.5, 0.5},
                                                {-3, 0},
                                                {1e300, 1},
                                                {Limits::infinity(), 1},
                                                {-Limits::infinity(), 0},
                                                {Limits::quiet_NaN(), 0}}) {
        hearOfTask({{"Progress", sdbus::Variant(told)}});
        EXPECT_EQ(theTask().progress, taken) << told;
        hear(PropertiesChanged{session, sessionInterface, {{"Progress", sdbus::Variant(told)}}});
        EXPECT_EQ(state_->sessions.at(0).progress, taken) << told;
    }
}

TEST_F(AnEngine, TellsOfItselfAndOfItsWearable) {
    EXPECT_EQ(hear(PropertiesChanged{enginePath, engineInterface, {{"RateLimit", count(5)}}}),
              Kind::StatusDidChange);
    EXPECT_EQ(state_->engine.rateLimit, 5);
    EXPECT_EQ(state_->engine.status, "calm");
    EXPECT_EQ(hear(PropertiesChanged{wearablePath, wearableInterface, {{"Songs", count(9)}}}),
              Kind::StatusDidChange);
    EXPECT_EQ(state_->wearable.songs, 9);
}

TEST_F(AnEngine, IsWordedInTheLanguageOfTheReaderWhereTheReaderKnowsTheWords) {
    const auto text = [](const char* words) { return sdbus::Variant(std::string(words)); };
    const auto arguments = sdbus::Variant(std::vector<std::string>{"2"});
    hear(PropertiesChanged{enginePath,
                           engineInterface,
                           {{"Status", text("ruhig")},
                            {"StatusCode", text(code::upToDateBut)},
                            {"StatusArguments", arguments},
                            {"LastMessage", text("fertig")},
                            {"LastCode", text(code::synced)},
                            {"LastArguments", arguments}}});
    EXPECT_EQ(state_->engine.status, sentence({code::upToDateBut, {"2"}}));
    EXPECT_EQ(state_->engine.lastMessage, sentence({code::synced, {"2"}}));

    hear(PropertiesChanged{enginePath,
                           engineInterface,
                           {{"Status", text("ruhig")},
                            {"StatusCode", text("calm")},
                            {"LastMessage", text("fertig")},
                            {"LastCode", text("done")}}});
    EXPECT_EQ(state_->engine.status, "ruhig");
    EXPECT_EQ(state_->engine.lastMessage, "fertig");
}

TEST_F(AnEngine, ListsItsWearable) {
    hear(ObjectsListed{
        {{sdbus::ObjectPath(wearablePath), {{wearableInterface, {{"Songs", count(9)}}}}}}});
    EXPECT_EQ(state_->wearable.songs, 9);
}

TEST_F(AnEngine, LeavesAStateThatSomebodyStillReadsAsItWas) {
    const auto before = state_;
    const auto copy = *before;

    hearOfTask({{"Progress", sdbus::Variant(0.75)}});
    hear(ObjectRemoved{session, {sessionInterface}});
    hear(EngineGone{"ended"});

    EXPECT_EQ(*before, copy);
}

} // namespace
