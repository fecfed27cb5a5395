#pragma once

#include "runtime/services/ObservedSession.h"
#include "tests/support/Journal.h"

namespace quorl::tests {

/// A task whose figures the test sets.
class TestTask final : public DVSessionTask {
  public:
    struct Figures {
        bool running = false;
        NSUInteger total = 0;
        NSUInteger completed = 0;
        double progress = 0;
    };

    TestTask(std::string groupingKey, Figures figures)
        : groupingKey_(std::move(groupingKey)), figures_(figures) {}

    void become(Figures figures) { figures_ = figures; }

    [[nodiscard]] bool isRunning() const override { return figures_.running; }

    [[nodiscard]] const std::string& sessionGroupingKey() const override { return groupingKey_; }

    [[nodiscard]] NSUInteger totalItemCount() const override { return figures_.total; }

    [[nodiscard]] NSUInteger completedItemCount() const override { return figures_.completed; }

    [[nodiscard]] double progress() const override { return figures_.progress; }

  private:
    std::string groupingKey_;
    Figures figures_;
};

/// A session whose tasks and callbacks the test sets off, with a line "session NAME add" or
/// "session NAME remove" for each observer that comes and goes.
class TestSession final : public ObservedSession {
  public:
    TestSession(std::string name, Journal& journal) : name_(std::move(name)), journal_(journal) {}

    std::shared_ptr<TestTask> addAssetTask(TestTask::Figures figures);
    std::shared_ptr<TestTask> addOtherTask(TestTask::Figures figures);

    /// From now on there are no lists of tasks, not even empty ones.
    void loseTasks() { tasksAreLost_ = true; }

    void finish() { finished_ = true; }

    void addObserver(const std::shared_ptr<DVSessionObserver>& observer) override;
    void removeObserver(const std::shared_ptr<DVSessionObserver>& observer) override;

    [[nodiscard]] bool isFinished() const override { return finished_; }

    [[nodiscard]] NSArray<DVSessionTask> sessionTasks() const override;
    [[nodiscard]] NSArray<DVSessionTask>
    sessionTasksWithGroupingKey(const std::string& key) const override;

  private:
    std::string name_;
    Journal& journal_;
    std::vector<std::shared_ptr<DVSessionTask>> tasks_;
    bool tasksAreLost_ = false;
    bool finished_ = false;
};

} // namespace quorl::tests
