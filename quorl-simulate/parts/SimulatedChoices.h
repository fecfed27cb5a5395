#pragma once

#include <functional>

#include "quorl-simulate/Random.h"
#include "quorl-syncd/engine/ports/ChoiceStore.h"

namespace quorl::simulation {

/// The preferences, whose writes can fail, and of which a loss of power takes what was not
/// promised.
class SimulatedChoices final : public syncd::ChoiceStore {
  public:
    /// @param before called before each write; what it throws ends the writing.
    /// @param remembered all was written.
    SimulatedChoices(std::function<void()> before,
                     std::function<void(const syncd::SentPlaylist&)> remembered)
        : before_(std::move(before)), remembered_(std::move(remembered)) {}

    /// As the app has written it; durable only at the next promise, or when the power is not lost.
    syncd::Choices now;

    /// Has writes fail, after this many more have gone well; -1 for never.
    int writesUntilFailure = -1;

    [[nodiscard]] syncd::Choices read() override { return now; }

    [[nodiscard]] std::string rememberSent(const syncd::SentPlaylist& sent) override {
        for (const bool isLast : {false, true}) {
            if (!write()) {
                return "The preferences cannot be written.";
            }
            // Half of it is not known to anybody.
            now.lastSent = isLast ? std::optional(sent) : std::nullopt;
            durable_ = now;
        }
        remembered_(sent);
        return {};
    }

    [[nodiscard]] std::string forgetSent() override {
        for (int part = 0; part < 2; ++part) {
            if (!write()) {
                return "The preferences cannot be written.";
            }
            now.lastSent.reset();
            durable_ = now;
        }
        return {};
    }

    [[nodiscard]] std::string switchOff() override {
        if (!write()) {
            return "The preferences cannot be written.";
        }
        now.isSyncEnabled = false;
        durable_ = now;
        return {};
    }

    void losePower(Random& random) {
        if (random.onceIn(2)) {
            now = durable_;
        }
        durable_ = now;
    }

  private:
    [[nodiscard]] bool write() {
        before_();
        const bool fails = writesUntilFailure == 0;
        writesUntilFailure -= writesUntilFailure > 0 ? 1 : 0;
        return !fails;
    }

    const std::function<void()> before_;
    const std::function<void(const syncd::SentPlaylist&)> remembered_;
    syncd::Choices durable_;
};

} // namespace quorl::simulation
