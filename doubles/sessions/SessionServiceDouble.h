#pragma once

#include "quorl-script/Trace.h"
#include "runtime/services/ObservedSession.h"

namespace quorl {

/// What a script says of a task and of a session.
struct TaskDescription {
    std::string id;
    std::string group; ///< the grouping key
    bool isRunning = false;
    NSUInteger total = 0;
    NSUInteger completed = 0;
    double progress = 0;
};

struct SessionDescription {
    std::string id;
    bool isFinished = false;
    std::vector<TaskDescription> tasks;
};

class ScriptedTask final : public DVSessionTask {
  public:
    void describe(const TaskDescription& description) { description_ = description; }

    [[nodiscard]] const std::string& id() const { return description_.id; }

    [[nodiscard]] bool isRunning() const override { return description_.isRunning; }

    [[nodiscard]] const std::string& sessionGroupingKey() const override {
        return description_.group;
    }

    [[nodiscard]] NSUInteger totalItemCount() const override { return description_.total; }

    [[nodiscard]] NSUInteger completedItemCount() const override { return description_.completed; }

    [[nodiscard]] double progress() const override { return description_.progress; }

  private:
    TaskDescription description_;
};

class ScriptedSession final : public ObservedSession {
  public:
    ScriptedSession(std::string id, std::shared_ptr<Trace> trace)
        : id_(std::move(id)), trace_(std::move(trace)) {}

    /// Takes over the figures; a task whose id stays is the same object.
    void describe(const SessionDescription& description);

    [[nodiscard]] const std::string& id() const { return id_; }

    /// Null where there is none with this id.
    [[nodiscard]] std::shared_ptr<ScriptedTask> task(const std::string& id) const;

    void addObserver(const std::shared_ptr<DVSessionObserver>& observer) override;
    void removeObserver(const std::shared_ptr<DVSessionObserver>& observer) override;

    [[nodiscard]] bool isFinished() const override { return isFinished_; }

    [[nodiscard]] NSArray<DVSessionTask> sessionTasks() const override;
    [[nodiscard]] NSArray<DVSessionTask>
    sessionTasksWithGroupingKey(const std::string& key) const override;

  private:
    std::string id_;
    std::shared_ptr<Trace> trace_;
    bool isFinished_ = false;
    std::vector<std::shared_ptr<ScriptedTask>> tasks_;
};

/// The sessions of a script. Main thread.
class ScriptedSessions {
  public:
    explicit ScriptedSessions(std::shared_ptr<Trace> trace) : trace_(std::move(trace)) {}

    /// Puts others in place of these; announces nothing. A session whose id stays is the same
    /// object, which takes over the figures.
    void replace(const std::vector<SessionDescription>& sessions);

    [[nodiscard]] NSArray<DVSession> ofType(const std::string& type) const;

    /// The session with this id: of those listed, else of those that were listed and are still in
    /// use; null where there is none.
    [[nodiscard]] std::shared_ptr<ScriptedSession> find(const std::string& id) const;

  private:
    std::shared_ptr<Trace> trace_;
    std::vector<std::shared_ptr<ScriptedSession>> listed_;
    std::vector<std::weak_ptr<ScriptedSession>> earlier_;
};

} // namespace quorl
