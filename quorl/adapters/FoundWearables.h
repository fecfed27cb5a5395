#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "services/base/Errand.h"
#include "services/finding/Finder.h"

namespace quorl {

/// The wearables that were found by themselves, and the ejecting of drives; neither waits for a
/// device. Main thread.
class FoundWearables {
  public:
    /// Called when something was found, or has gone.
    using Changed = std::function<void()>;

    /// Is called with an empty text, or with a sentence that says what was in the way.
    using Done = std::function<void(const std::string& problem)>;

    /// Begins to look. Throws `std::system_error` where no thread can be started.
    explicit FoundWearables(Changed changed);
    ~FoundWearables();

    FoundWearables(const FoundWearables&) = delete;
    FoundWearables& operator=(const FoundWearables&) = delete;

    /// Nothing as long as it is still looked for the first time.
    [[nodiscard]] const std::optional<finding::Found>& found() const { return found_; }

    /// What was ejected and not plugged in again since, by name.
    [[nodiscard]] std::vector<std::string> safeToRemove() const;

    /// Makes the drive of an offer ready to be taken away. `done` is called unless this is gone by
    /// then. One at a time: nothing where another one is still under way, or the offer's drive
    /// cannot be ejected. Throws as the constructor.
    void eject(const finding::Offer& offer, Done done);

    [[nodiscard]] bool isEjecting() const { return ejection_ != nullptr; }

  private:
    void take(const finding::Found& found);
    void endEjection(const finding::Offer& offer, const std::string& problem, const Done& done);

    const Changed changed_;
    /// Those who come late find nobody any more.
    const std::shared_ptr<FoundWearables*> self_ = std::make_shared<FoundWearables*>(this);
    std::optional<finding::Found> found_;
    std::vector<finding::Offer> ejected_;
    std::unique_ptr<base::Errand> ejection_;
    finding::Finder finder_;
};

} // namespace quorl
