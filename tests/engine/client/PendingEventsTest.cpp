#include "services/engine/PendingEvents.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using namespace quorl::engine;
using Kind = Event::Kind;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

Event event(Kind kind, const std::string& task = {}, const std::string& message = {}) {
    auto state = std::make_shared<TaskState>();
    state->path = task;
    return {.kind = kind,
            .state = std::make_shared<EngineState>(),
            .task = task.empty() ? nullptr : state,
            .message = message};
}

std::vector<std::string> messagesOf(const std::vector<Event>& events) {
    std::vector<std::string> messages;
    for (const auto& each : events) {
        messages.push_back(each.message);
    }
    return messages;
}

TEST(APendingEvent, IsTakenOnceAndInItsOrder) {
    PendingEvents pending;
    EXPECT_TRUE(pending.isEmpty());
    pending.add(event(Kind::TaskWillBegin, "/a", "1"));
    pending.add(event(Kind::TaskDidBegin, "/a", "2"));
    pending.add(event(Kind::TaskDidBegin, "/a", "3"));
    EXPECT_FALSE(pending.isEmpty());

    EXPECT_THAT(messagesOf(pending.take()), ElementsAre("1", "2", "3"));
    EXPECT_THAT(pending.take(), IsEmpty());
}

TEST(APendingEvent, GivesWayToLaterNewsOfTheSame) {
    PendingEvents pending;
    for (int round = 0; round < 1000; ++round) {
        pending.add(event(Kind::TaskDidUpdate, "/a", "a" + std::to_string(round)));
        pending.add(event(Kind::TaskDidUpdate, "/b", "b" + std::to_string(round)));
        pending.add(event(Kind::StatusDidChange, {}, "status" + std::to_string(round)));
    }

    EXPECT_THAT(messagesOf(pending.take()), ElementsAre("a999", "b999", "status999"));
}

TEST(APendingEvent, StaysBeforeWhatHappenedAfterIt) {
    PendingEvents pending;
    pending.add(event(Kind::TaskDidUpdate, "/a", "half"));
    pending.add(event(Kind::TaskDidFinish, "/a", "end"));
    pending.add(event(Kind::TaskDidUpdate, "/a", "late"));

    EXPECT_THAT(messagesOf(pending.take()), ElementsAre("half", "end", "late"));
}

} // namespace
