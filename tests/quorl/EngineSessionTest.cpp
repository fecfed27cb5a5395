#include "quorl/adapters/EngineSession.h"

#include <gmock/gmock.h>

namespace quorl::tests {

namespace {

using engine::SessionState;
using engine::TaskState;

std::shared_ptr<const SessionState> withTasks(std::vector<TaskState> tasks) {
    auto session = std::make_shared<SessionState>();
    session->path = "/session";
    session->tasks = std::move(tasks);
    return session;
}

TaskState taskAt(const std::string& path, std::uint64_t total = 0) {
    return {.path = path, .groupingKey = "key" + path, .totalItemCount = total};
}

TEST(EngineSession, tasksThatStayKeepTheirObjects) {
    EngineSession session;
    session.show(withTasks({taskAt("/a", 1), taskAt("/b", 2)}));
    const auto a = session.sessionTasks()->at(0);
    const auto b = session.sessionTasks()->at(1);

    session.show(withTasks({taskAt("/b", 20), taskAt("/c", 30)}));

    ASSERT_EQ(session.sessionTasks()->size(), 2);
    EXPECT_EQ(session.sessionTasks()->at(0), b);
    EXPECT_EQ(b->totalItemCount(), 20);
    EXPECT_EQ(session.sessionTasks()->at(1)->totalItemCount(), 30);
    EXPECT_EQ(a->totalItemCount(), 1) << "what is gone is as it last was";
}

TEST(EngineSession, hasItsTasksByTheirKindToo) {
    EngineSession session;
    session.show(withTasks({taskAt("/a"), taskAt("/b")}));

    const auto found = session.sessionTasksWithGroupingKey("key/b");

    ASSERT_EQ(found->size(), 1);
    EXPECT_EQ(found->at(0), session.sessionTasks()->at(1));
    EXPECT_TRUE(session.sessionTasksWithGroupingKey("other")->empty());
}

TEST(EngineSession, lastsOnlyAsLongAsItsEngineSaysSoButMayBeReadLonger) {
    std::vector<std::shared_ptr<EngineSession>> sessions;
    auto first = std::make_shared<std::vector<SessionState>>(2);
    first->at(0).path = "/1";
    first->at(1).path = "/2";
    showAll(sessions, *first, first);
    const auto one = sessions.at(0);
    const auto two = sessions.at(1);

    auto second = std::make_shared<std::vector<SessionState>>(1);
    second->at(0).path = "/2";
    second->at(0).isFinished = true;
    showAll(sessions, *second, second);
    first.reset();
    second.reset();

    EXPECT_THAT(sessions, testing::ElementsAre(two));
    EXPECT_TRUE(two->isFinished());
    EXPECT_FALSE(one->isFinished());
    EXPECT_EQ(find(sessions, "/1"), nullptr);
}

} // namespace

} // namespace quorl::tests
