#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "quorl-syncd/engine/AttachedWearable.h"
#include "quorl-syncd/engine/EnginePorts.h"
#include "quorl-syncd/engine/NotReady.h"
#include "quorl-syncd/engine/Policy.h"
#include "quorl-syncd/engine/RetryDelay.h"
#include "quorl-syncd/engine/Shortfall.h"
#include "services/engine/EngineState.h"

namespace quorl::syncd {

/// What the engine is started with.
struct EngineSettings {
    /// Empty for the user's music folder.
    std::string musicFolder;
    /// Empty for the wearable that is embedded in this machine.
    std::string wearableDirectory;
    /// Of a copy to the embedded wearable, in bytes a second; 0 for none.
    std::uint64_t rateLimit = 0;
    /// After which a sync that did not work is tried again for the first time.
    std::chrono::seconds retryDelay{60};
};

/// Syncs what is chosen when it is time to, and keeps the preferences up to date. Everything is
/// called in turns; see `Turns`.
class Engine {
  public:
    /// @param ports outlive the engine. Changes of the choices are to be told with
    /// `choicesDidChange`.
    Engine(const EnginePorts& ports, const EngineSettings& settings);

    /// Ends a running sync in order, and waits for that as long as its device answers.
    ~Engine();

    Engine(const Engine&) = delete;
    Engine& operator=(const Engine&) = delete;

    void choicesDidChange();

    [[nodiscard]] const engine::EngineStatus& status() const { return status_; }

    [[nodiscard]] engine::WearableStatus wearable() const { return wearable_.status(); }

    /// Throws `NotReady`.
    void startNow();
    void cancel();

    /// Switches sync off, then removes all that is ours from the wearable. Throws `NotReady`.
    void removeMusic();

    /// The next two take a directory that need not be there. They throw `NotReady` where the
    /// process has no more threads or files for it; then all is as it was.
    void setMusicFolder(const std::string& path);
    void setRateLimit(std::uint64_t bytesPerSecond);
    void setWearableDirectory(const std::string& path);
    /// Throws `NotReady` for a mounted wearable.
    void attach(const wearable::AttachmentChange& change);

    [[nodiscard]] wearable::Attachment attachment() const { return wearable_.attachment(); }

    void refreshWearable() { wearable_.refresh(); }

  private:
    /// A sync that is under way.
    struct Ongoing {
        Order order;
        Charger charger;
        /// Nothing as long as nobody has.
        std::optional<engine::Message> whyStopped;
        /// Since that was last looked at.
        bool hasMoved = false;
        std::unique_ptr<SessionReport> session;
        std::unique_ptr<RunningSync> sync;
    };

    [[nodiscard]] Situation situation() const;
    void consider();
    void begin(const wearable::Selection& selection);
    void noteStall(std::uint64_t session);
    void stop(const engine::Message& why);
    [[nodiscard]] bool isHopeless() const;
    void abandon();
    void finish(const Outcome& outcome);
    [[nodiscard]] std::string remember(const Order& order);
    void conclude(bool success, const engine::Message& message);
    void putOff(const wearable::Selection& selection, const std::string& why);
    void keepResult(const std::string& wearable, bool success, const engine::Message& message);
    void tryAgainLater();
    void lookAgainLater();

    void wearableDidChange(AttachedWearable::Change change);
    void applyRateLimit();
    void tellLastResult();
    [[nodiscard]] std::optional<Order> wishedOrder() const;
    void countShortfall();
    void publish();

    const EnginePorts ports_;
    engine::EngineStatus status_;
    AttachedWearable wearable_;

    bool isStartRequested_ = false;
    bool isRemovalRequested_ = false;
    std::optional<wearable::Selection> givenUp_;
    RetryDelay retry_;
    const std::chrono::seconds lookDelay_;
    bool isLookDue_ = false;
    Clock::TimePoint quietFrom_;
    std::uint64_t sessions_ = 0;

    using SongProblems = std::vector<engine::Message>;

    /// What was last tried to the end, and which of its songs could not be sent.
    struct Tried {
        std::optional<wearable::Selection> selection;
        SongProblems problems;
    };

    Tried tried_;
    Shortfall shortfall_;
    /// What it is the shortfall of.
    std::optional<wearable::Selection> countedFor_;
    std::shared_ptr<const media::Inventory> countedIn_;

    std::shared_ptr<const media::Inventory> inventory_;
    std::unique_ptr<WatchedMusic> music_;
    std::optional<Ongoing> ongoing_;
};

} // namespace quorl::syncd
