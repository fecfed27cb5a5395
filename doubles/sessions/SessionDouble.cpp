#include "doubles/sessions/SessionDouble.h"

#include <algorithm>

#include "doubles/sessions/ById.h"

namespace quorl {

using Tasks = std::vector<std::shared_ptr<DVSessionTask>>;

void SessionDouble::describe(const SessionDescription& description) {
    isFinished_ = description.isFinished;
    auto earlier = std::exchange(tasks_, {});
    for (const TaskDescription& task : description.tasks) {
        const auto same = takeById(earlier, task.id);
        tasks_.push_back(same ? same : std::make_shared<TaskDouble>(task));
        tasks_.back()->describe(task);
    }
}

std::shared_ptr<TaskDouble> SessionDouble::addAssetTask(const TaskFigures& figures) {
    return addTask(DVDeviceSyncSessionAssetTaskGroupingKey, figures);
}

std::shared_ptr<TaskDouble> SessionDouble::addOtherTask(const TaskFigures& figures) {
    return addTask("another kind of work", figures);
}

std::shared_ptr<TaskDouble> SessionDouble::addTask(const std::string& group,
                                                   const TaskFigures& figures) {
    const TaskDescription description{std::to_string(tasks_.size()), group, figures};
    return tasks_.emplace_back(std::make_shared<TaskDouble>(description));
}

std::shared_ptr<TaskDouble> SessionDouble::task(const std::string& id) const {
    const auto found = std::find_if(tasks_.begin(), tasks_.end(),
                                    [&id](const auto& task) { return task->id() == id; });
    return found == tasks_.end() ? nullptr : *found;
}

void SessionDouble::addObserver(const std::shared_ptr<DVSessionObserver>& observer) {
    recorder_->sessionWillAddObserver(id_);
    ObservedSession::addObserver(observer);
}

void SessionDouble::removeObserver(const std::shared_ptr<DVSessionObserver>& observer) {
    recorder_->sessionWillRemoveObserver(id_);
    ObservedSession::removeObserver(observer);
}

NSArray<DVSessionTask> SessionDouble::sessionTasks() const {
    return tasksAreLost_ ? nullptr : std::make_shared<const Tasks>(tasks_.begin(), tasks_.end());
}

NSArray<DVSessionTask> SessionDouble::sessionTasksWithGroupingKey(const std::string& key) const {
    recorder_->sessionWillListTasks(id_, key);
    if (tasksAreLost_) {
        return nullptr;
    }
    Tasks tasks;
    std::copy_if(tasks_.begin(), tasks_.end(), std::back_inserter(tasks),
                 [&key](const auto& task) { return task->sessionGroupingKey() == key; });
    return std::make_shared<const Tasks>(std::move(tasks));
}

} // namespace quorl
