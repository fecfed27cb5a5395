#include "doubles/sessions/SessionServiceDouble.h"

#include <algorithm>
#include <iterator>

#include "doubles/sessions/ById.h"

namespace quorl {

void ScriptedSession::describe(const SessionDescription& description) {
    isFinished_ = description.isFinished;
    auto earlier = std::exchange(tasks_, {});
    for (const TaskDescription& task : description.tasks) {
        auto same = takeById(earlier, task.id);
        tasks_.push_back(same ? same : std::make_shared<ScriptedTask>());
        tasks_.back()->describe(task);
    }
}

std::shared_ptr<ScriptedTask> ScriptedSession::task(const std::string& id) const {
    const auto found = std::find_if(tasks_.begin(), tasks_.end(),
                                    [&id](const auto& task) { return task->id() == id; });
    return found == tasks_.end() ? nullptr : *found;
}

void ScriptedSession::addObserver(const std::shared_ptr<DVSessionObserver>& observer) {
    trace_->record("DVSession", "addObserver:", id_);
    ObservedSession::addObserver(observer);
}

void ScriptedSession::removeObserver(const std::shared_ptr<DVSessionObserver>& observer) {
    trace_->record("DVSession", "removeObserver:", id_);
    ObservedSession::removeObserver(observer);
}

NSArray<DVSessionTask> ScriptedSession::sessionTasks() const {
    return std::make_shared<const std::vector<std::shared_ptr<DVSessionTask>>>(tasks_.begin(),
                                                                               tasks_.end());
}

NSArray<DVSessionTask> ScriptedSession::sessionTasksWithGroupingKey(const std::string& key) const {
    std::vector<std::shared_ptr<DVSessionTask>> tasks;
    std::copy_if(tasks_.begin(), tasks_.end(), std::back_inserter(tasks),
                 [&key](const auto& task) { return task->sessionGroupingKey() == key; });
    return std::make_shared<const std::vector<std::shared_ptr<DVSessionTask>>>(std::move(tasks));
}

void ScriptedSessions::replace(const std::vector<SessionDescription>& sessions) {
    auto before = std::exchange(listed_, {});
    for (const SessionDescription& description : sessions) {
        auto same = takeById(before, description.id);
        listed_.push_back(same ? same : std::make_shared<ScriptedSession>(description.id, trace_));
        listed_.back()->describe(description);
    }
    earlier_.insert(earlier_.begin(), before.begin(), before.end());
    before.clear();
    std::erase_if(earlier_, [](const auto& session) { return session.expired(); });
}

NSArray<DVSession> ScriptedSessions::ofType(const std::string& type) const {
    trace_->record("DVSession", "sessionsWithSessionTypeIdentifier:", type);
    std::vector<std::shared_ptr<DVSession>> sessions;
    if (type == DVSessionTypeDeviceSync) {
        sessions.assign(listed_.begin(), listed_.end());
    }
    return std::make_shared<const std::vector<std::shared_ptr<DVSession>>>(std::move(sessions));
}

std::shared_ptr<ScriptedSession> ScriptedSessions::find(const std::string& id) const {
    for (const auto& session : listed_) {
        if (session->id() == id) {
            return session;
        }
    }
    for (const auto& reference : earlier_) {
        if (auto session = reference.lock(); session && session->id() == id) {
            return session;
        }
    }
    return nullptr;
}

} // namespace quorl
