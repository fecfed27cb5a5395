#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "quorl-syncd/daemon/Lifeline.h"
#include "quorl-syncd/daemon/LocalWearables.h"
#include "services/engine/BusLoop.h"
#include "services/finding/SurroundingsWatch.h"
#include "services/preferences/SharedPreferences.h"

namespace quorl::syncd {

/// The wearable that was chosen for good: remembers it, and says which directory it is in, for the
/// drive that it is on may be mounted elsewhere the next time. The loop's thread.
class ChosenWearable {
  public:
    /// Is told the directory, also where it is the same: whether the wearable is there is to be
    /// looked at again. Empty for the embedded one.
    using Moved = std::function<void(const std::string& directory)>;

    /// Loop and preferences outlive this.
    /// @param other that the engine was started with instead, which goes before the one that was
    /// chosen until the next choice; empty for none.
    ChosenWearable(engine::BusLoop& loop, preferences::SharedPreferences& preferences,
                   const std::string& other);
    ~ChosenWearable();

    ChosenWearable(const ChosenWearable&) = delete;
    ChosenWearable& operator=(const ChosenWearable&) = delete;

    /// What is against taking a directory for the wearable that was chosen. Asks the disk service.
    [[nodiscard]] LocalWearables::Objection objection() const;

    /// Has `moved` called in turns of its own whenever the drive comes, goes or is mounted
    /// elsewhere, and within `readAgain` and `remember`. Throws `std::system_error` where no thread
    /// can be started.
    void watch(Moved moved);

    /// Somebody else has changed the settings.
    void readAgain();

    /// Writes the directory and the drive that it is on, for which it asks the disk service. Gives
    /// back an empty text, or a sentence
    /// that says why it could not be done; then the settings are as they were.
    [[nodiscard]] std::string remember(const std::string& directory);

  private:
    class Expected;

    void take(const finding::Surroundings& surroundings);
    void settle();

    engine::BusLoop& loop_;
    preferences::SharedPreferences& preferences_;
    const std::shared_ptr<Expected> expected_;
    finding::Surroundings surroundings_;
    bool isFollowed_;
    Moved moved_;
    const Lifeline lifeline_;
    std::optional<finding::SurroundingsWatch> watch_;
};

} // namespace quorl::syncd
