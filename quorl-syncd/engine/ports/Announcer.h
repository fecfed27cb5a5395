#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>

#include "quorl-syncd/transfer/CopyProgress.h"

namespace quorl::syncd {

/// Tells clients of one sync, from construction to destruction.
class SessionReport {
  public:
    /// The session is gone, for clients too.
    virtual ~SessionReport() = default;

    virtual void copied(const CopyProgress& progress) = 0;

    /// Once, as the last. May throw `std::runtime_error` where there is nobody to tell any more.
    virtual void finish(bool success, const std::string& message) = 0;
};

/// Tells clients what the engine does.
class Announcer {
  public:
    virtual ~Announcer() = default;

    /// `Engine::status` and `Engine::wearable` may give something else.
    virtual void stateDidChange() = 0;

    /// A sync begins.
    /// @param number tells it from all others of this engine.
    /// @param cancel to be called, in a turn of its own, when a client asks for the end.
    [[nodiscard]] virtual std::unique_ptr<SessionReport>
    beginSession(std::uint64_t number, std::function<void()> cancel) = 0;
};

} // namespace quorl::syncd
