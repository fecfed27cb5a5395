#pragma once

#include "doubles/CallRecorder.h"
#include "doubles/sessions/TaskDouble.h"
#include "runtime/services/ObservedSession.h"

namespace quorl {

struct SessionDescription {
    std::string id;
    bool isFinished = false;
    std::vector<TaskDescription> tasks;
};

/// A session that becomes whatever it is described as. Whoever plays the device tells its
/// observers.
class SessionDouble final : public ObservedSession {
  public:
    SessionDouble(std::string id, std::shared_ptr<CallRecorder> recorder)
        : id_(std::move(id)), recorder_(std::move(recorder)) {}

    /// Takes all over but the id; a task whose id stays is the same object.
    void describe(const SessionDescription& description);

    std::shared_ptr<TaskDouble> addAssetTask(const TaskFigures& figures);
    std::shared_ptr<TaskDouble> addOtherTask(const TaskFigures& figures);

    void finish() { isFinished_ = true; }

    /// From now on there are no lists of tasks, not even empty ones.
    void loseTasks() { tasksAreLost_ = true; }

    [[nodiscard]] const std::string& id() const { return id_; }

    /// Null where there is none with this id.
    [[nodiscard]] std::shared_ptr<TaskDouble> task(const std::string& id) const;

    void addObserver(const std::shared_ptr<DVSessionObserver>& observer) override;
    void removeObserver(const std::shared_ptr<DVSessionObserver>& observer) override;

    [[nodiscard]] bool isFinished() const override { return isFinished_; }

    [[nodiscard]] NSArray<DVSessionTask> sessionTasks() const override;
    [[nodiscard]] NSArray<DVSessionTask>
    sessionTasksWithGroupingKey(const std::string& key) const override;

  private:
    std::shared_ptr<TaskDouble> addTask(const std::string& group, const TaskFigures& figures);

    std::string id_;
    std::shared_ptr<CallRecorder> recorder_;
    bool isFinished_ = false;
    bool tasksAreLost_ = false;
    std::vector<std::shared_ptr<TaskDouble>> tasks_;
};

} // namespace quorl
