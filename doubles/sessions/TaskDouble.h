#pragma once

#include "platform/SyncSessions.h"

namespace quorl {

struct TaskFigures {
    bool isRunning = false;
    NSUInteger total = 0;
    NSUInteger completed = 0;
    double progress = 0;
};

struct TaskDescription {
    std::string id;
    std::string group; ///< the grouping key
    TaskFigures figures;
};

/// A task that becomes whatever it is described as.
class TaskDouble final : public DVSessionTask {
  public:
    explicit TaskDouble(TaskDescription description) : description_(std::move(description)) {}

    void describe(const TaskDescription& description) { description_ = description; }

    void become(const TaskFigures& figures) { description_.figures = figures; }

    [[nodiscard]] const std::string& id() const { return description_.id; }

    [[nodiscard]] bool isRunning() const override { return description_.figures.isRunning; }

    [[nodiscard]] const std::string& sessionGroupingKey() const override {
        return description_.group;
    }

    [[nodiscard]] NSUInteger totalItemCount() const override { return description_.figures.total; }

    [[nodiscard]] NSUInteger completedItemCount() const override {
        return description_.figures.completed;
    }

    [[nodiscard]] double progress() const override { return description_.figures.progress; }

  private:
    TaskDescription description_;
};

} // namespace quorl
