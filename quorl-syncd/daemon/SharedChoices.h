#pragma once

#include "quorl-syncd/engine/ports/ChoiceStore.h"
#include "services/preferences/SharedPreferences.h"

namespace quorl::syncd {

/// The choices in the preferences of the session.
class SharedChoices final : public ChoiceStore {
  public:
    explicit SharedChoices(preferences::SharedPreferences& preferences)
        : preferences_(preferences) {}

    [[nodiscard]] Choices read() override;
    [[nodiscard]] std::string rememberSent(const SentPlaylist& sent) override;
    [[nodiscard]] std::string forgetSent() override;
    [[nodiscard]] std::string switchOff() override;

  private:
    preferences::SharedPreferences& preferences_;
};

} // namespace quorl::syncd
