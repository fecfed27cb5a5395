#pragma once

#include <algorithm>
#include <memory>
#include <vector>

#include "runtime/services/ObservedSession.h"
#include "services/engine/EngineState.h"

namespace quorl {

/// A task of the sync engine, as it was when it was last shown. Main thread.
class EngineTask final : public DVSessionTask {
  public:
    /// From now on it has the figures of `task`, which is not null.
    void show(std::shared_ptr<const engine::TaskState> task) { task_ = std::move(task); }

    [[nodiscard]] const std::string& path() const { return task_->path; }

    [[nodiscard]] bool isRunning() const override { return task_->isRunning; }

    [[nodiscard]] const std::string& sessionGroupingKey() const override {
        return task_->groupingKey;
    }

    [[nodiscard]] NSUInteger totalItemCount() const override;
    [[nodiscard]] NSUInteger completedItemCount() const override;

    [[nodiscard]] double progress() const override { return task_->progress; }

  private:
    std::shared_ptr<const engine::TaskState> task_;
};

/// A session of the sync engine, as it was when it was last shown. Its tasks keep their identity
/// from one time to the next. Main thread, apart from its observers.
class EngineSession final : public ObservedSession {
  public:
    /// From now on it has the figures of `session`, which is not null.
    void show(std::shared_ptr<const engine::SessionState> session);

    [[nodiscard]] const std::string& path() const { return session_->path; }

    [[nodiscard]] const std::string& type() const { return session_->typeIdentifier; }

    /// The object that stands for a task; null: it has none of this path.
    [[nodiscard]] std::shared_ptr<EngineTask> task(const std::string& path) const;

    [[nodiscard]] bool isFinished() const override { return session_->isFinished; }

    [[nodiscard]] NSArray<DVSessionTask> sessionTasks() const override;
    [[nodiscard]] NSArray<DVSessionTask>
    sessionTasksWithGroupingKey(const std::string& key) const override;

  private:
    std::shared_ptr<const engine::SessionState> session_;
    std::vector<std::shared_ptr<EngineTask>> tasks_;
};

/// The object of this path; null: there is none.
template <class Object>
[[nodiscard]] std::shared_ptr<Object> find(const std::vector<std::shared_ptr<Object>>& objects,
                                           const std::string& path) {
    const auto found = std::find_if(objects.begin(), objects.end(),
                                    [&path](const auto& object) { return object->path() == path; });
    return found == objects.end() ? nullptr : *found;
}

/// An object for each of `states`, in their order; those that stay keep theirs. `owner` keeps the
/// states alive.
template <class Object, class State, class Owner>
void showAll(std::vector<std::shared_ptr<Object>>& objects, const std::vector<State>& states,
             const std::shared_ptr<Owner>& owner) {
    std::vector<std::shared_ptr<Object>> shown;
    for (const State& state : states) {
        const auto known = find(objects, state.path);
        shown.push_back(known ? known : std::make_shared<Object>());
        shown.back()->show({owner, &state});
    }
    objects = std::move(shown);
}

} // namespace quorl
