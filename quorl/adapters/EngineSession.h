#pragma once

#include <atomic>
#include <map>
#include <mutex>

#include "runtime/services/ObservedSession.h"
#include "services/engine/EngineState.h"

namespace quorl {

/// A task of the sync engine, with the figures that the engine gave last. Any thread.
class EngineTask final : public DVSessionTask {
  public:
    explicit EngineTask(const engine::TaskState& task);

    void update(const engine::TaskState& task);

    [[nodiscard]] bool isRunning() const override { return isRunning_; }

    [[nodiscard]] const std::string& sessionGroupingKey() const override { return groupingKey_; }

    [[nodiscard]] NSUInteger totalItemCount() const override { return total_; }

    [[nodiscard]] NSUInteger completedItemCount() const override { return completed_; }

    [[nodiscard]] double progress() const override { return progress_; }

  private:
    const std::string groupingKey_;
    std::atomic<bool> isRunning_;
    std::atomic<NSUInteger> total_;
    std::atomic<NSUInteger> completed_;
    std::atomic<double> progress_;
};

/// A session of the sync engine. Its tasks keep their identity from one figure to the next. Any
/// thread.
class EngineSession final : public ObservedSession {
  public:
    explicit EngineSession(const engine::SessionState& session);

    /// The object that stands for `task`, with its figures taken over; made where there is none
    /// yet.
    std::shared_ptr<EngineTask> update(const engine::TaskState& task);

    /// Takes over everything that the engine tells of the session.
    void update(const engine::SessionState& session);

    [[nodiscard]] const std::string& type() const { return type_; }

    [[nodiscard]] bool isFinished() const override { return isFinished_; }

    [[nodiscard]] NSArray<DVSessionTask> sessionTasks() const override;
    [[nodiscard]] NSArray<DVSessionTask>
    sessionTasksWithGroupingKey(const std::string& key) const override;

  private:
    const std::string type_;
    std::atomic<bool> isFinished_;
    mutable std::mutex mutex_;
    std::vector<std::pair<std::string, std::shared_ptr<EngineTask>>> tasks_; ///< by path, in order
};

} // namespace quorl
