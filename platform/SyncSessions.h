#pragma once

#include "platform/Foundation.h"

/// The sessions in which the platform's sync engine brings data to the wearable.

class DVSession;

/// One piece of a session's work. The figures are of the moment of asking. Main thread.
class DVSessionTask : public NSObject {
  public:
    [[nodiscard]] virtual bool isRunning() const = 0;

    /// What kind of work it is, for instance `DVDeviceSyncSessionAssetTaskGroupingKey`.
    [[nodiscard]] virtual const std::string& sessionGroupingKey() const = 0;

    [[nodiscard]] virtual NSUInteger totalItemCount() const = 0;
    [[nodiscard]] virtual NSUInteger completedItemCount() const = 0;

    /// The fraction that is done, usually from 0 to 1.
    [[nodiscard]] virtual double progress() const = 0;
};

/// Is told what happens in a session that it was added to. Every method may be left out. They may
/// be called on any thread.
class DVSessionObserver {
  public:
    virtual ~DVSessionObserver() = default;

    virtual void sessionWillBegin(DVSession& /*session*/) {}

    virtual void sessionDidFinish(DVSession& /*session*/) {}

    virtual void session_willBeginSessionTask(DVSession& /*session*/, DVSessionTask& /*task*/) {}

    virtual void session_didBeginSessionTask(DVSession& /*session*/, DVSessionTask& /*task*/) {}

    virtual void session_didUpdateSessionTask(DVSession& /*session*/, DVSessionTask& /*task*/) {}

    virtual void session_didFinishSessionTask(DVSession& /*session*/, DVSessionTask& /*task*/) {}
};

/// One run of the sync engine. Main thread, except that observers are called on any thread.
class DVSession : public NSObject {
  public:
    /// The sessions of a type that exist now, never null.
    [[nodiscard]] static NSArray<DVSession>
    sessionsWithSessionTypeIdentifier(const std::string& type);

    /// Attaches an observer, which the session does not own. Attaching it twice counts once.
    virtual void addObserver(const std::shared_ptr<DVSessionObserver>& observer) = 0;

    /// Detaches an observer; one that is not attached is no error.
    virtual void removeObserver(const std::shared_ptr<DVSessionObserver>& observer) = 0;

    [[nodiscard]] virtual bool isFinished() const = 0;

    /// All tasks of the session; null counts as none.
    [[nodiscard]] virtual NSArray<DVSessionTask> sessionTasks() const = 0;

    /// The tasks of one kind; null counts as none.
    [[nodiscard]] virtual NSArray<DVSessionTask>
    sessionTasksWithGroupingKey(const std::string& key) const = 0;
};

/// The type of the sessions that bring data to the wearable.
extern const std::string DVSessionTypeDeviceSync;

/// The grouping key of the tasks that carry the music itself.
extern const std::string DVDeviceSyncSessionAssetTaskGroupingKey;

/// Posted on the main thread, with no object, when a session has come or gone.
extern const NSNotificationName DVSessionsDidChangeNotification;
