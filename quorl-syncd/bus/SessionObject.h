#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>

#include <sdbus-c++/sdbus-c++.h>

#include "quorl-syncd/engine/ports/Announcer.h"

namespace quorl::syncd {

/// A session and its two tasks, as bus objects from construction to destruction. Says each thing on
/// the bus in the order that the interface promises. The bus loop's thread.
class SessionObject final : public SessionReport {
  public:
    /// Begins with the preparing task.
    /// @param cancel called when a client asks for the end.
    SessionObject(sdbus::IConnection& bus, std::uint64_t number, std::function<void()> cancel);

    /// Takes the objects off the bus.
    ~SessionObject() override;

    SessionObject(const SessionObject&) = delete;
    SessionObject& operator=(const SessionObject&) = delete;

    /// The first call ends the preparing task and begins the one that carries the songs.
    void copied(const CopyProgress& progress) override;

    /// Ends what is still running, then the session. Once.
    void finish(bool success, const std::string& message) override;

  private:
    class Session;
    class Task;

    const std::unique_ptr<Session> session_;
    const std::unique_ptr<Task> preparing_;
    const std::unique_ptr<Task> copying_;
};

} // namespace quorl::syncd
