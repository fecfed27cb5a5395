#pragma once

#include <functional>
#include <memory>
#include <string>

#include "services/engine/Event.h"
#include "services/engine/Names.h"

namespace quorl::engine {

/// A connection to the sync engine of this session, which is started where it does not run. All
/// methods may be called on any thread, also within a listener's call, and return at once.
class Client {
  public:
    /// Is told what happens, on the client's own thread, one event at a time and in the order in
    /// which it happened. Must not throw, nor destroy the client.
    using Listener = std::function<void(const Event&)>;

    /// Of many settings of one property in a row only the last one reaches the engine, and its
    /// reply is made to all of them. Called exactly once on the client's own thread: with an empty
    /// text, or with a sentence that says why it was not done. Must not throw, nor destroy the
    /// client.
    using Reply = std::function<void(const std::string& problem)>;

    /// Connects in the background.
    /// @param name the engine's, on the session bus; any engine with the same interfaces will do.
    explicit Client(Listener listener, std::string name = busName);

    /// Ends the thread. Replies that are still open are made; the listener is told nothing any
    /// more.
    ~Client();

    Client(const Client&) = delete;
    Client& operator=(const Client&) = delete;

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
    /// Switches music sync off, and has what was synced to the wearable removed from it.
    void removeMusic(Reply reply = {});
    /// Whether a person sees by this client how the engine does. Counts for this engine and for
    /// each that comes after it, as long as this client lives; starts none. Where nothing is to be
    /// told, the reply is made at once.
    void setWatching(bool isWatching, Reply reply = {});

  private:
    class Connection;

    std::unique_ptr<Connection> connection_;
};

} // namespace quorl::engine
