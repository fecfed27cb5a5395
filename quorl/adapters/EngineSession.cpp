#include "quorl/adapters/EngineSession.h"

#include <algorithm>

namespace quorl {

EngineTask::EngineTask(const engine::TaskState& task)
    : groupingKey_(task.groupingKey),
      isRunning_(task.isRunning),
      total_(static_cast<NSUInteger>(task.totalItemCount)),
      completed_(static_cast<NSUInteger>(task.completedItemCount)),
      progress_(task.progress) {}

void EngineTask::update(const engine::TaskState& task) {
    isRunning_ = task.isRunning;
    total_ = static_cast<NSUInteger>(task.totalItemCount);
    completed_ = static_cast<NSUInteger>(task.completedItemCount);
    progress_ = task.progress;
}

EngineSession::EngineSession(const engine::SessionState& session)
    : type_(session.typeIdentifier), isFinished_(session.isFinished) {
    update(session);
}

std::shared_ptr<EngineTask> EngineSession::update(const engine::TaskState& task) {
    const std::lock_guard lock(mutex_);
    const auto known = std::find_if(tasks_.begin(), tasks_.end(), [&task](const auto& entry) {
        return entry.first == task.path;
    });
    if (known != tasks_.end()) {
        known->second->update(task);
        return known->second;
    }
    return tasks_.emplace_back(task.path, std::make_shared<EngineTask>(task)).second;
}

void EngineSession::update(const engine::SessionState& session) {
    for (const engine::TaskState& task : session.tasks) {
        update(task);
    }
    isFinished_ = session.isFinished;
}

NSArray<DVSessionTask> EngineSession::sessionTasks() const {
    auto tasks = std::make_shared<std::vector<std::shared_ptr<DVSessionTask>>>();
    const std::lock_guard lock(mutex_);
    for (const auto& [path, task] : tasks_) {
        tasks->push_back(task);
    }
    return tasks;
}

NSArray<DVSessionTask> EngineSession::sessionTasksWithGroupingKey(const std::string& key) const {
    auto tasks = std::make_shared<std::vector<std::shared_ptr<DVSessionTask>>>();
    const std::lock_guard lock(mutex_);
    for (const auto& [path, task] : tasks_) {
        if (task->sessionGroupingKey() == key) {
            tasks->push_back(task);
        }
    }
    return tasks;
}

} // namespace quorl
