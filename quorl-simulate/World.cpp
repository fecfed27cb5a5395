#include "quorl-simulate/World.h"

#include <cerrno>
#include <iterator>
#include <system_error>
#include <utility>

#include "quorl-simulate/parts/SimulatedVolume.h"

namespace quorl::simulation {

namespace {

using namespace std::chrono_literals;

constexpr std::uint64_t capacity = 60'000;
constexpr auto noticedAfter = 1ms;
constexpr auto patience = 30s;

Trouble troubleOf(int error) {
    return error == ENOSPC  ? Trouble::Full
           : error == EROFS ? Trouble::WriteProtected
                            : Trouble::Away;
}

} // namespace

World::World(const Life& life, Trace trace)
    : life_(life),
      trace_(std::move(trace)),
      isEmbedded_(life.rules == DiskRules::Posix && life.seed % 2 == 0),
      turns_([plant = life.plant](VirtualTurns::Duration untilThen) {
          return plant == Plant::NoRetry && untilThen > patience;
      }),
      music_(turns_),
      choices_(
          [this] {
              performDueEvents();
              ++moments_;
          },
          [this](const syncd::SentPlaylist& sent) { checkRemembered(sent); }),
      announcer_(
          {[this](const std::string& what) { breach(what); },
           [this] {
               ++sessions_;
               noteTroublesOfSession();
           },
           [this](bool success, const std::string& message) { checkMessage(success, message); }}),
      syncs_(
          turns_,
          {[this](const wearable::Wearable&) { return openVolume(); }, music_, turns_, turns_},
          [this] {
              isCleaningUp_ = false;
              check();
              if (end_) {
                  throw EngineEnded();
              }
          },
          life.plant == Plant::SentBeforeManifest) {
    for (int count = 0; count < 2; ++count) {
        wearables_.push_back({SimulatedDisk(life.rules, capacity, largestFile)});
    }
    const Quiet quiet(isQuiet_);
    for (std::size_t index = 0; index < wearables_.size(); ++index) {
        auto& disk = wearables_[index].disk;
        disk.setBefore([this, index](std::string_view operation, std::string_view name) {
            beforeOperation(index, operation, name);
        });
        static_cast<void>(SimulatedVolume(disk).makeDirectory(syncd::Volume::Directory::Music));
        disk.syncAll();
    }
    Random random(life.seed);
    for (int count = 0; count < 6; ++count) {
        addSong(random);
    }
    addFileOfOthers(random);
    device().disk.syncAll();
    choices_.now.isSyncEnabled = true;
    choices_.now.playlist = firstList;
    choices_.now.limitType = 1;
    choices_.now.limit = 8;
}

World::~World() {
    isDead_ = true;
    engine_.reset();
}

LifeResult World::live() {
    startEngine();
    while (!breach_ && nextEvent_ < life_.events.size()) {
        step();
    }
    if (!breach_) {
        bringPeace();
    }
    constexpr std::uint64_t mostMoments = 4'000;
    const auto peaceFrom = moments_;
    while (!breach_ && !isAtRest()) {
        if (moments_ - peaceFrom > mostMoments || turns_.isIdle()) {
            breach("does not come to rest: " + engine_->status().status);
        }
        step();
    }
    if (!breach_) {
        checkEnd();
    }
    return {breach_, operations_, sessions_, moments_ - momentOfEvent_};
}

/// One turn; or, where none is left, the next event.
void World::step() {
    try {
        ++moments_;
        performDueEvents();
        if (!turns_.isIdle()) {
            turns_.takeTurn();
        } else if (nextEvent_ < life_.events.size()) {
            moments_ += life_.events[nextEvent_].wait;
        }
        check();
        checkStatus();
    } catch (const EngineEnded&) {
        revive();
    }
}

void World::performDueEvents() {
    while (!isQuiet_ && !isDead_ && nextEvent_ < life_.events.size() &&
           moments_ - momentOfEvent_ >= life_.events[nextEvent_].wait) {
        momentOfEvent_ = moments_;
        perform(life_.events[nextEvent_++]);
    }
}

void World::perform(const Event& event) {
    if (trace_) {
        const Quiet quiet(isQuiet_);
        trace_("-- " + std::string(nameOf(event.what)) + " " + std::to_string(event.seed));
        wearableBefore_ = device().text();
    }
    Random random(event.seed);
    {
        const Quiet quiet(isQuiet_);
        happenToMusic(event.what, random);
        happenToSong(event.what, random);
        happenToChoices(event.what, random);
        happenToDevice(event, random);
        happenToFiles(event.what, random);
    }
    happenToEngine(event);
}

/// What happens beside a sync happens before one of its operations.
void World::beforeOperation(std::size_t wearable, std::string_view operation,
                            std::string_view name) {
    if (isQuiet_) {
        return;
    }
    if (isDead_) {
        throw EngineEnded();
    }
    ++moments_;
    ++operations_;
    turns_.pass(isSlow_ ? 20s : 1ms);
    check();
    performDueEvents();
    while (!end_ && turns_.isDue()) {
        turns_.takeTurn();
    }
    if (isDead_) {
        throw EngineEnded();
    }
    if (trace_) {
        trace_("   " + std::string(operation) + " " + std::string(name));
    }
    if (wearable != current_ || openedAt_ != pluggings_) {
        note(Trouble::Away);
        throw std::system_error(ENODEV, std::generic_category());
    }
    // Not all devices keep times.
    if (operation != "utimens" && operationsToFail_ > 0 && !isCleaningUp_) {
        --operationsToFail_;
        note(troubleOf(errorOfOperations_));
        throw std::system_error(errorOfOperations_, std::generic_category());
    }
    noteTroublesOfDevice();
}

void World::noteTroublesOfDevice() {
    if (isReadOnly_) {
        note(Trouble::WriteProtected);
    }
    if (device().disk.available() < capacity / 4) {
        note(Trouble::Full);
    }
}

/// Those that have lasted for some time.
void World::noteTroublesOfSession() {
    troubles_.sessionBegins(turns_.now());
    for (const auto& [path, song] : music_.songs) {
        if (!song->isReadable) {
            note(Trouble::SongUnreadable);
        }
        if (song->bytes.size() > largestFile) {
            note(Trouble::SongTooLarge);
        }
    }
    if (choices_.writesUntilFailure >= 0) {
        note(Trouble::BadPreferences);
    }
}

void World::startEngine() {
    isNotLookedAt_ = true;
    engine_ = std::make_unique<syncd::Engine>(
        syncd::EnginePorts{turns_, choices_, music_, *this, syncs_, *this, announcer_},
        syncd::EngineSettings{{}, isEmbedded_ ? "" : "/device", 0, 60s});
}

/// A sync that is under way is waited for where the engine ends in order.
void World::endEngine(End end, std::uint64_t seed) {
    seedOfEnd_ = seed;
    note(Trouble::Ended);
    if (end == End::Orderly && syncs_.isRunning()) {
        end_ = end_.value_or(end);
        syncs_.stop();
        return;
    }
    end_ = end == End::Killed && isCleaningUp_ ? End::PowerLost : end;
    isDead_ = end != End::Orderly;
    throw EngineEnded();
}

/// The engine has ended, and is started again.
void World::revive() {
    if (breach_) {
        return;
    }
    const auto end = *std::exchange(end_, std::nullopt);
    syncs_.forget();
    isCleaningUp_ = false;
    engine_.reset();
    turns_.forget();
    music_.forget();
    isDead_ = false;
    ++pluggings_;
    if (end == End::PowerLost) {
        const Quiet quiet(isQuiet_);
        Random random(seedOfEnd_);
        for (auto& wearable : wearables_) {
            wearable.losePower(random);
        }
        choices_.losePower(random);
    }
    check();
    startEngine();
}

/// Keeps nothing up to date while it is not looked at.
struct World::Looked final : syncd::WatchedWearable {
    explicit Looked(World& world) : world_(world) {}

    [[nodiscard]] wearable::Wearable identity() const override { return world_.identity(); }

    void look(Reply reply) override {
        const auto asked = std::pair(world_.news_, world_.pluggings_);
        const auto answer = [this, reply = std::move(reply), asked] {
            reply(world_.look());
            // Else it was asked of another wearable, perhaps, and may not count for the engine.
            if (asked == std::pair(world_.news_, world_.pluggings_)) {
                world_.wasLookedAt();
            }
        };
        world_.turns_.callAt(world_.turns_.now() + noticedAfter, answer);
    }

    void save(const wearable::AttachmentChange& change, Saved saved) override {
        if (world_.isDead_) {
            return;
        }
        world_.attachment_ = change.appliedTo(world_.attachment_);
        world_.turns_.call([saved = std::move(saved)] { saved({}); });
    }

    World& world_;
};

wearable::Wearable World::identity() const {
    return isEmbedded_ ? wearable::Wearable{"/embedded", capacity, false}
                       : wearable::Wearable{"/device", std::nullopt, true};
}

std::unique_ptr<syncd::WatchedWearable> World::watch(const std::string& /*directory*/,
                                                     Noticed noticed) {
    noticed_ = std::move(noticed);
    return std::make_unique<Looked>(*this);
}

void World::wasLookedAt() {
    isNotLookedAt_ = !isPlugged_;
    device().isClaimExcused =
        device().isClaimExcused && (device().isExcused || announcer_.isSessionThere());
}

syncd::WatchedWearable::Answer World::look() {
    const Quiet quiet(isQuiet_);
    if (!isPlugged_) {
        return wearable::Unseen{{wearable::unseen::unreachable, {"/device", "No such device"}}};
    }
    try {
        return syncd::Sight{identity(), device().usage(), attachment_};
    } catch (const wearable::BadManifest& error) {
        note(Trouble::BadManifest);
        return wearable::Unseen{error.message()};
    }
}

std::unique_ptr<syncd::Volume> World::openVolume() {
    if (!isPlugged_) {
        note(Trouble::Away);
        throw std::system_error(ENODEV, std::generic_category());
    }
    openedAt_ = pluggings_;
    opened_ = current_;
    {
        const Quiet quiet(isQuiet_);
        device().engineLooks();
        if (device().readableManifest() == nullptr) {
            note(Trouble::BadManifest);
        }
    }
    noteTroublesOfDevice();
    auto volume = std::make_unique<SimulatedVolume>(device().disk, [this] {
        const bool fails = syncsToFail_ > 0;
        syncsToFail_ -= fails ? 1 : 0;
        if (fails) {
            note(Trouble::Away);
            isCleaningUp_ = true;
        }
        return fails;
    });
    return planted(life_.plant, std::move(volume));
}

syncd::LastResult World::of(const std::string& /*wearable*/) const { return lastResult_; }

void World::remember(const std::string& /*wearable*/, syncd::LastResult result) {
    if (!isDead_) {
        lastResult_ = std::move(result);
    }
}

LifeResult liveOnce(const Life& life, const Trace& trace) { return World(life, trace).live(); }

} // namespace quorl::simulation
