#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "quorl-simulate/Life.h"
#include "quorl-simulate/Troubles.h"
#include "quorl-simulate/parts/InlineSyncs.h"
#include "quorl-simulate/parts/SimulatedChoices.h"
#include "quorl-simulate/parts/SimulatedMusic.h"
#include "quorl-simulate/parts/SimulatedWearable.h"
#include "quorl-simulate/parts/WatchfulAnnouncer.h"
#include "quorl-syncd/engine/Engine.h"

namespace quorl::simulation {

/// Is given a line for each thing that happens.
using Trace = std::function<void(const std::string&)>;

/// A promise that was not kept.
struct Breach {
    std::string what;
    std::string wearableBefore; ///< before the event that came last
    std::string wearable;
};

struct LifeResult {
    std::optional<Breach> breach;
    std::uint64_t operations = 0; ///< of the wearable
    std::uint64_t syncs = 0;
    /// Operations and turns from the last event until all was at rest.
    std::uint64_t moments = 0;
};

/// The engine, and everything that it touches, in one life.
class World : private syncd::WearablePort, private syncd::ResultStore {
  public:
    World(const Life& life, Trace trace);
    ~World() override;

    World(const World&) = delete;
    World& operator=(const World&) = delete;

    /// Once.
    [[nodiscard]] LifeResult live();

  private:
    /// Thrown where the engine ends in the middle of what it does.
    struct EngineEnded {};

    enum class End { Orderly, Killed, PowerLost };

    struct Looked;

    /// Nobody is asked before what a hand does, or before a look from outside.
    class Quiet {
      public:
        explicit Quiet(bool& flag) : flag_(flag), before_(std::exchange(flag, true)) {}

        ~Quiet() { flag_ = before_; }

        Quiet(const Quiet&) = delete;
        Quiet& operator=(const Quiet&) = delete;

      private:
        bool& flag_;
        const bool before_;
    };

    static constexpr std::uint64_t firstList = 1;
    static constexpr std::uint64_t largestFile = 9'000;

    // Time.
    void step();
    void perform(const Event& event);
    void performDueEvents();
    void beforeOperation(std::size_t wearable, std::string_view operation, std::string_view name);

    void note(Trouble trouble) { troubles_.note(trouble, turns_.now()); }

    void noteTroublesOfDevice();
    void noteTroublesOfSession();
    void endEngine(End end, std::uint64_t seed);
    void startEngine();
    void revive();

    // What happens; see `Happening`.
    void happenToMusic(Happening what, Random& random);
    void happenToSong(Happening what, Random& random);
    void happenToChoices(Happening what, Random& random);
    void happenToDevice(const Event& event, Random& random);
    void failOperations(std::uint64_t seed);
    void happenToFiles(Happening what, Random& random);
    void happenToEngine(const Event& event);
    void plug(bool isPlugged, bool isOther, Random& random);
    void addSong(Random& random);
    void addFileOfOthers(Random& random);
    void damageManifest(Random& random);
    [[nodiscard]] std::string wantedName(Random& random) const;
    [[nodiscard]] std::string someOfOurs(Random& random) const;

    // What is promised.
    void breach(const std::string& what);
    void check();
    void checkFilesOfOthers(const SimulatedWearable& wearable);
    void checkManifest(SimulatedWearable& wearable);
    void checkSent(const SimulatedWearable& wearable, const wearable::Manifest& manifest);
    void checkPreferences(const SimulatedWearable& wearable);
    void checkPlaylist(const SimulatedWearable& wearable, const wearable::Manifest& manifest);
    void checkRemembered(const syncd::SentPlaylist& sent);
    void checkMessage(bool success, const std::string& message);
    void checkStatus();
    [[nodiscard]] std::string obstacle();
    [[nodiscard]] bool isSent();

    // The end.
    void bringPeace();
    void mendDevices();
    void mendMusic();
    void mendChoices();
    void removeBadManifest();
    [[nodiscard]] bool isAtRest();
    void checkEnd();
    void checkNothingElse(const wearable::Manifest& manifest);

    // Ports.
    [[nodiscard]] std::unique_ptr<syncd::WatchedWearable> watch(const std::string& directory,
                                                                Noticed noticed) override;
    [[nodiscard]] wearable::Wearable identity() const;
    [[nodiscard]] syncd::WatchedWearable::Answer look();
    void wasLookedAt();
    [[nodiscard]] syncd::LastResult of(const std::string& wearable) const override;
    void remember(const std::string& wearable, syncd::LastResult result) override;
    [[nodiscard]] std::unique_ptr<syncd::Volume> openVolume();

    [[nodiscard]] SimulatedWearable& device() { return wearables_[current_]; }

    [[nodiscard]] const SimulatedWearable& device() const { return wearables_[current_]; }

    const Life life_;
    const Trace trace_;
    const bool isEmbedded_;

    VirtualTurns turns_;
    SimulatedMusic music_;
    SimulatedChoices choices_;
    WatchfulAnnouncer announcer_;
    InlineSyncs syncs_;
    std::vector<SimulatedWearable> wearables_;
    std::size_t current_ = 0;

    // How things stand.
    bool isPlugged_ = true;
    wearable::Attachment attachment_;
    /// Changes whenever what was opened on a wearable is of no use any more.
    std::uint64_t pluggings_ = 0;
    std::uint64_t openedAt_ = 0;
    /// How often the engine has heard that the wearable may be another.
    std::uint64_t news_ = 0;
    std::size_t opened_ = 0;
    /// Since another one was put in its place, or the engine was started.
    bool isNotLookedAt_ = true;
    bool isReadOnly_ = false;
    bool isSlow_ = false;
    /// Until something is changed, neither a sync that was cancelled nor a song that could not be
    /// read is tried again.
    bool isCancelled_ = false;
    bool isSongUnlocked_ = false;
    std::uint64_t operationsToFail_ = 0;
    int errorOfOperations_ = 0;
    std::uint64_t syncsToFail_ = 0;
    /// In the sync that is under way; what could not be made durable has to be removed.
    bool isCleaningUp_ = false;
    syncd::LastResult lastResult_;
    Noticed noticed_;

    Troubles troubles_;

    std::size_t nextEvent_ = 0;
    std::uint64_t moments_ = 0;
    std::uint64_t momentOfEvent_ = 0;
    std::uint64_t operations_ = 0;
    std::uint64_t sessions_ = 0;
    bool isQuiet_ = false;
    bool isDead_ = false;
    std::optional<End> end_;
    /// From which it follows what a loss of power leaves.
    std::uint64_t seedOfEnd_ = 0;
    std::string wearableBefore_;
    std::optional<Breach> breach_;

    std::unique_ptr<syncd::Engine> engine_;
};

/// Lives one life.
[[nodiscard]] LifeResult liveOnce(const Life& life, const Trace& trace = {});

} // namespace quorl::simulation
