#pragma once

#include <functional>
#include <memory>
#include <string>

#include "services/engine/EngineState.h"
#include "services/engine/Names.h"

namespace quorl::engine {

/// Is told what happens to the engine, on the client's own thread, one call at a time and in the
/// order in which it happened. `Client::state` already has it. Every method may be left out. None
/// may throw, nor destroy the client.
class Listener {
  public:
    virtual ~Listener() = default;

    /// The engine is there, and `state` is everything that it had to tell. Comes again whenever it
    /// was restarted. Sessions that are running then are not told one by one.
    virtual void engineDidAppear(const EngineState& /*state*/) {}

    /// There is no engine, or none any more; no sessions either. That is no error: one may come.
    /// `reason` says why, for the user.
    virtual void engineDidVanish(const std::string& /*reason*/) {}

    /// The session bus is gone, and nothing comes any more. `problem` says what to do.
    virtual void busDidVanish(const std::string& /*problem*/) {}

    virtual void sessionWillBegin(const SessionState& /*session*/) {}

    virtual void taskWillBegin(const SessionState& /*session*/, const TaskState& /*task*/) {}

    virtual void taskDidBegin(const SessionState& /*session*/, const TaskState& /*task*/) {}

    virtual void taskDidUpdate(const SessionState& /*session*/, const TaskState& /*task*/) {}

    /// `message` is a sentence for the user.
    virtual void taskDidFinish(const SessionState& /*session*/, const TaskState& /*task*/,
                               bool /*success*/, const std::string& /*message*/) {}

    virtual void sessionDidFinish(const SessionState& /*session*/, bool /*success*/,
                                  const std::string& /*message*/) {}

    /// The session is no longer in `state`.
    virtual void sessionDidVanish(const SessionState& /*session*/) {}

    /// The engine's own status or that of the wearable is another one.
    virtual void statusDidChange() {}
};

/// A connection to the sync engine of this session, which is started where it does not run. All
/// methods may be called on any thread, also within a listener's call, and return at once.
class Client {
  public:
    /// Called exactly once on the client's own thread: with an empty text, or with a sentence that
    /// says why it was not done. Must not throw, nor destroy the client.
    using Reply = std::function<void(const std::string& problem)>;

    /// Connects in the background.
    /// @param listener outlives the client.
    /// @param name the engine's, on the session bus; any engine with the same interfaces will do.
    explicit Client(Listener& listener, std::string name = busName);

    /// Ends the thread. Replies that are still open are made; the listener is told nothing any
    /// more.
    ~Client();

    Client(const Client&) = delete;
    Client& operator=(const Client&) = delete;

    [[nodiscard]] EngineState state() const;

    void startNow(Reply reply = {});
    void cancel(Reply reply = {});
    /// An empty path stands for the user's own music folder.
    void setMusicFolder(const std::string& path, Reply reply = {});
    /// Bytes a second for the embedded wearable; 0 for no limit.
    void setRateLimit(std::uint64_t bytesPerSecond, Reply reply = {});
    /// An empty path stands for the embedded wearable.
    void setWearableDirectory(const std::string& path, Reply reply = {});
    /// For the embedded wearable only, as the next.
    void setConnected(bool connected, Reply reply = {});
    void setOnCharger(bool onCharger, Reply reply = {});
    /// Has the byte counts of the wearable looked at again.
    void refreshWearable(Reply reply = {});

  private:
    class Connection;

    std::unique_ptr<Connection> connection_;
};

} // namespace quorl::engine
