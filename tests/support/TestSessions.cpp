#include "tests/support/TestSessions.h"

#include <algorithm>

namespace quorl::tests {

using Tasks = std::vector<std::shared_ptr<DVSessionTask>>;

std::shared_ptr<TestTask> TestSession::addAssetTask(TestTask::Figures figures) {
    const auto task = std::make_shared<TestTask>(DVDeviceSyncSessionAssetTaskGroupingKey, figures);
    tasks_.push_back(task);
    return task;
}

std::shared_ptr<TestTask> TestSession::addOtherTask(TestTask::Figures figures) {
    const auto task = std::make_shared<TestTask>("another kind of work", figures);
    tasks_.push_back(task);
    return task;
}

void TestSession::addObserver(const std::shared_ptr<DVSessionObserver>& observer) {
    journal_.note("session " + name_ + " add");
    ObservedSession::addObserver(observer);
}

void TestSession::removeObserver(const std::shared_ptr<DVSessionObserver>& observer) {
    journal_.note("session " + name_ + " remove");
    ObservedSession::removeObserver(observer);
}

NSArray<DVSessionTask> TestSession::sessionTasks() const {
    return tasksAreLost_ ? nullptr : std::make_shared<const Tasks>(tasks_);
}

NSArray<DVSessionTask> TestSession::sessionTasksWithGroupingKey(const std::string& key) const {
    if (tasksAreLost_) {
        return nullptr;
    }
    Tasks matching;
    std::copy_if(tasks_.begin(), tasks_.end(), std::back_inserter(matching),
                 [&key](const auto& task) { return task->sessionGroupingKey() == key; });
    return std::make_shared<const Tasks>(std::move(matching));
}

} // namespace quorl::tests
