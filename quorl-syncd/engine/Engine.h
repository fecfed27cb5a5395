#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "quorl-syncd/engine/LastResults.h"
#include "quorl-syncd/engine/RetryDelay.h"
#include "quorl-syncd/transfer/Order.h"
#include "quorl-syncd/transfer/RateLimit.h"
#include "quorl-syncd/transfer/Sync.h"
#include "services/base/MountWatch.h"
#include "services/base/RootWatch.h"
#include "services/engine/BusLoop.h"
#include "services/engine/EngineState.h"
#include "services/media/MusicFolder.h"
#include "services/preferences/SharedPreferences.h"
#include "services/wearable/Attachment.h"
#include "services/wearable/UsageReader.h"

namespace quorl::syncd {

class SessionObject;

/// What the engine is started with.
struct EngineSettings {
    /// Empty for the user's music folder.
    std::string musicFolder;
    /// Empty for the wearable that is embedded in this machine.
    std::string wearableDirectory;
    /// Of the embedded wearable, in bytes.
    std::uint64_t embeddedCapacity = wearable::embeddedCapacity;
    /// In bytes a second; 0 for none.
    std::uint64_t rateLimit = 0;
    /// After which a sync that did not work is tried again for the first time.
    std::chrono::seconds retryDelay{60};
};

/// The engine cannot do what a client asks for now. The text is a sentence for the user.
class NotReady : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

/// Decides when to sync what, and keeps the preferences up to date. Everything is called on the
/// loop's thread; what comes from other threads goes through the loop.
class Engine {
  public:
    /// Called when `status` or `wearable` may give something else.
    using Changed = std::function<void()>;

    /// @param loop outlives the engine.
    /// @param preferences outlives the engine; its changes are to be told with
    /// `preferencesDidChange`.
    Engine(engine::BusLoop& loop, preferences::SharedPreferences& preferences,
           const EngineSettings& options, Changed changed);

    /// Ends a running sync in order, and waits for that.
    ~Engine();

    Engine(const Engine&) = delete;
    Engine& operator=(const Engine&) = delete;

    void preferencesDidChange();

    [[nodiscard]] const engine::EngineStatus& status() const { return status_; }

    [[nodiscard]] const engine::WearableStatus& wearable() const { return wearableStatus_; }

    /// Throws `NotReady`.
    void startNow();
    void cancel();

    void setMusicFolder(const std::string& path);
    void setRateLimit(std::uint64_t bytesPerSecond);
    /// Throws `std::filesystem::filesystem_error` or `std::system_error` where the embedded one
    /// cannot be made.
    void setWearableDirectory(const std::string& path);
    /// Throws `NotReady` for a mounted wearable, and where it cannot be remembered.
    void attach(const wearable::Attachment& attachment);

    [[nodiscard]] const wearable::Attachment& attachment() const { return attachment_; }

    void refreshWearable();

  private:
    struct Run;

    void consider();
    [[nodiscard]] std::optional<Order> currentOrder(bool ignoresCharger);
    [[nodiscard]] bool isDue(const Order& order) const;
    [[nodiscard]] wearable::Selection selectionOf(const media::Playlist& playlist) const;
    [[nodiscard]] bool isSent(const wearable::Selection& selection) const;

    void begin(Order order);
    void stop(const std::string& why);
    void finish(const Outcome& outcome);
    [[nodiscard]] std::string remember(const Order& order);
    void conclude(bool success, const std::string& message);
    void tellLastResult();
    void tryAgainLater();

    void takeUsage(const wearable::UsageReader::Answer& answer);
    void watchWearable();
    void mountsDidChange();
    void unwatchWearable();
    void takeChoice();
    void publish();

    engine::BusLoop& loop_;
    preferences::SharedPreferences& preferences_;
    const std::uint64_t embeddedCapacity_;
    const Changed changed_;

    engine::EngineStatus status_;
    engine::WearableStatus wearableStatus_;
    /// What stands in the way of a sync, in a sentence; empty where nothing does.
    std::string obstacle_;

    std::shared_ptr<const media::Inventory> library_;

    wearable::Wearable wearable_;
    wearable::Attachment attachment_;
    /// Nothing while it is not there or was not looked at yet; then the sentence says why.
    std::optional<wearable::Usage> usage_;
    std::string wearableProblem_;
    std::optional<base::RootWatch> rootWatch_;
    std::optional<base::MountWatch> mountWatch_;
    /// Which reports still count.
    std::uint64_t wearables_ = 0;

    RateLimit rate_;
    bool isStartRequested_ = false;
    /// Did not work, and is not tried again until something changes or some time has passed.
    std::optional<wearable::Selection> givenUp_;
    RetryDelay retry_;
    LastResults results_;
    /// When the preferences are thought to stay as they are for now.
    engine::BusLoop::Clock::time_point settled_;
    std::uint64_t sessions_ = 0;

    // The last members, for their threads call this object through the loop.
    std::unique_ptr<Run> run_;
    std::unique_ptr<wearable::UsageReader> usageReader_;
    std::unique_ptr<media::MusicFolder> folder_;
};

} // namespace quorl::syncd
