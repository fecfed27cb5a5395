#include "quorl/adapters/EngineSession.h"

#include <limits>

namespace quorl {

namespace {

/// On machines with shorter words, as much as they hold.
NSUInteger countOf(std::uint64_t count) {
    return static_cast<NSUInteger>(
        std::min<std::uint64_t>(count, std::numeric_limits<NSUInteger>::max()));
}

} // namespace

NSUInteger EngineTask::totalItemCount() const { return countOf(task_->totalItemCount); }

NSUInteger EngineTask::completedItemCount() const { return countOf(task_->completedItemCount); }

void EngineSession::show(std::shared_ptr<const engine::SessionState> session) {
    session_ = std::move(session);
    showAll(tasks_, session_->tasks, session_);
}

std::shared_ptr<EngineTask> EngineSession::task(const std::string& path) const {
    return find(tasks_, path);
}

NSArray<DVSessionTask> EngineSession::sessionTasks() const {
    return std::make_shared<std::vector<std::shared_ptr<DVSessionTask>>>(tasks_.begin(),
                                                                         tasks_.end());
}

NSArray<DVSessionTask> EngineSession::sessionTasksWithGroupingKey(const std::string& key) const {
    auto tasks = std::make_shared<std::vector<std::shared_ptr<DVSessionTask>>>();
    std::copy_if(tasks_.begin(), tasks_.end(), std::back_inserter(*tasks),
                 [&key](const auto& task) { return task->sessionGroupingKey() == key; });
    return tasks;
}

} // namespace quorl
