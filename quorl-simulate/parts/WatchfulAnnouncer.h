#pragma once

#include <functional>
#include <string>

#include "quorl-syncd/engine/ports/Announcer.h"

namespace quorl::simulation {

/// Clients who know what they may be told.
class WatchfulAnnouncer final : public syncd::Announcer {
  public:
    struct Ears {
        /// Something was told that must not be told.
        std::function<void(const std::string&)> complain;
        std::function<void()> begun;
        std::function<void(bool success, const std::string& message)> finished;
    };

    explicit WatchfulAnnouncer(Ears ears) : ears_(std::move(ears)) {}

    void stateDidChange() override {}

    [[nodiscard]] std::unique_ptr<syncd::SessionReport>
    beginSession(std::uint64_t number, std::function<void()> cancel) override;

    /// As a client; nothing where no session is under way.
    void cancel() const;

    [[nodiscard]] bool isSessionThere() const { return sessions_ > 0; }

  private:
    class Report;

    const Ears ears_;
    std::function<void()> cancel_;
    int sessions_ = 0;
};

} // namespace quorl::simulation
