#include "quorl-syncd/engine/Engine.h"

#include <iostream>
#include <system_error>
#include <thread>

#include <glib.h>
#include <poll.h>

#include "quorl-syncd/bus/SessionObject.h"
#include "quorl-syncd/bus/SleepInhibitor.h"
#include "quorl-syncd/engine/SyncState.h"
#include "quorl-syncd/transfer/SteadyClock.h"
#include "quorl-syncd/transfer/device/PosixDevice.h"
#include "quorl-syncd/transfer/songs/PosixSongSource.h"
#include "services/base/AtomicFile.h"

namespace quorl::syncd {

namespace {

using LoopClock = engine::BusLoop::Clock;
using namespace std::chrono_literals;

/// The app writes several values for one choice.
constexpr auto settlingTime = 200ms;
constexpr auto timeBetweenUpdates = 100ms;

std::string userMusicFolder() {
    const char* const folder = g_get_user_special_dir(G_USER_DIRECTORY_MUSIC);
    return folder != nullptr ? folder : std::string{g_get_home_dir()} + "/Music";
}

std::filesystem::path stateDirectory() {
    return std::filesystem::path{g_get_user_state_dir()} / "quorl";
}

wearable::Wearable wearableAt(const std::string& path, std::uint64_t embeddedCapacity) {
    return path.empty() ? wearable::Wearable::embedded(embeddedCapacity)
                        : wearable::Wearable::mounted(path);
}

std::uint64_t microsecondsNow() {
    const auto now = std::chrono::system_clock::now().time_since_epoch();
    return static_cast<std::uint64_t>(
        std::chrono::duration_cast<std::chrono::microseconds>(now).count());
}

} // namespace

/// A sync under way: its thread, and what the bus is told of it.
struct Engine::Run {
    Order order;
    bool ignoresCharger;
    std::string whyStopped;
    std::unique_ptr<SessionObject> session;
    std::jthread thread;
};

Engine::Engine(engine::BusLoop& loop, preferences::SharedPreferences& preferences,
               const EngineSettings& options, Changed changed)
    : loop_{loop},
      preferences_{preferences},
      embeddedCapacity_{options.embeddedCapacity},
      changed_{std::move(changed)},
      retry_{options.retryDelay},
      results_{stateDirectory()} {
    setRateLimit(options.rateLimit);
    setWearableDirectory(options.wearableDirectory);
    setMusicFolder(options.musicFolder);
}

Engine::~Engine() {
    unwatchWearable();
    if (run_) {
        stop("The sync engine was ended.");
        run_->thread.join();
        try {
            conclude(false, run_->whyStopped);
        } catch (const sdbus::Error&) {
            // Without a bus there is nobody to tell.
        }
    }
}

void Engine::preferencesDidChange() {
    givenUp_.reset();
    settled_ = LoopClock::now() + settlingTime;
    loop_.callAt(settled_, [this] { consider(); });
    consider();
}

void Engine::startNow() {
    if (run_) {
        return;
    }
    if (!currentOrder(true)) {
        throw NotReady{obstacle_};
    }
    isStartRequested_ = true;
    consider();
}

void Engine::cancel() {
    if (run_) {
        givenUp_ = run_->order.selection;
        stop("The sync was cancelled.");
    }
}

void Engine::setMusicFolder(const std::string& path) {
    status_.musicFolder = path.empty() ? userMusicFolder() : path;
    // The old one first: what it has posted must not count for the new one.
    folder_.reset();
    library_.reset();
    const auto folder = status_.musicFolder;
    folder_ = std::make_unique<media::MusicFolder>(
        folder, [this, folder](std::shared_ptr<const media::Inventory> library) {
            loop_.post([this, folder, library = std::move(library)] {
                if (folder == status_.musicFolder) {
                    library_ = library;
                    consider();
                }
            });
        });
    consider();
}

void Engine::setRateLimit(std::uint64_t bytesPerSecond) {
    status_.rateLimit = bytesPerSecond;
    rate_.set(wearable_.isEmbedded() ? bytesPerSecond : 0);
    publish();
}

void Engine::setWearableDirectory(const std::string& path) {
    unwatchWearable();
    wearable_ = wearableAt(path, embeddedCapacity_);
    ++wearables_;
    usage_.reset();
    givenUp_.reset();
    wearableProblem_ = "Looking for the wearable…";
    attachment_ = {};
    tellLastResult();
    rate_.set(wearable_.isEmbedded() ? status_.rateLimit : 0);
    usageReader_ = std::make_unique<wearable::UsageReader>(wearable_);
    if (wearable_.isEmbedded()) {
        std::filesystem::create_directories(wearable_.root);
        attachment_ = wearable::loadAttachment(base::openRoot(wearable_.root.c_str()).get());
    } else {
        watchWearable();
    }
    refreshWearable();
    consider();
}

void Engine::attach(const wearable::Attachment& attachment) {
    if (!wearable_.isEmbedded()) {
        throw NotReady{"This wearable is a device; plug it in or out instead."};
    }
    try {
        wearable::saveAttachment(base::openRoot(wearable_.root.c_str()).get(), attachment);
    } catch (const std::system_error& error) {
        throw NotReady{"The wearable could not remember it: " + error.code().message() + "."};
    }
    attachment_ = attachment;
    givenUp_.reset();
    consider();
}

void Engine::refreshWearable() {
    usageReader_->ask([this, number = wearables_](const wearable::UsageReader::Answer& answer) {
        loop_.post([this, number, answer] {
            if (number == wearables_) {
                takeUsage(answer);
            }
        });
    });
}

void Engine::takeUsage(const wearable::UsageReader::Answer& answer) {
    if (const auto* const usage = std::get_if<wearable::Usage>(&answer)) {
        if (!usage_) {
            givenUp_.reset();
        }
        usage_ = *usage;
    } else {
        usage_.reset();
        wearableProblem_ = std::get<std::string>(answer);
    }
    consider();
}

void Engine::watchWearable() {
    rootWatch_.emplace(wearable_.root);
    mountWatch_.emplace(wearable_.root);
    loop_.watch(rootWatch_->descriptor(), POLLIN, [this] {
        if (rootWatch_->take()) {
            refreshWearable();
        }
    });
    loop_.watch(mountWatch_->descriptor(), POLLPRI, [this] {
        if (mountWatch_->take()) {
            mountsDidChange();
        }
    });
}

/// A directory that once was a mounted wearable is none without it.
void Engine::mountsDidChange() {
    if (!wearable_.isMountPoint && wearable::isMountPoint(wearable_.root)) {
        setWearableDirectory(wearable_.root);
    } else {
        refreshWearable();
    }
}

void Engine::unwatchWearable() {
    if (rootWatch_) {
        loop_.unwatch(rootWatch_->descriptor());
        loop_.unwatch(mountWatch_->descriptor());
        rootWatch_.reset();
        mountWatch_.reset();
    }
}

/// What is to be on the wearable; nothing where something stands in the way.
std::optional<Order> Engine::currentOrder(bool ignoresCharger) {
    const auto id = preferences_.get(preferences::assetSyncPlaylistPersistentID);
    const auto* const playlist = library_ && id ? library_->playlist(*id) : nullptr;
    obstacle_ = !preferences_.get(preferences::assetSyncEnabled) ? "Music sync is switched off."
                : !id                                            ? "No playlist is chosen."
                : !library_                                      ? "Reading the music folder…"
                : playlist == nullptr    ? "The chosen playlist is not in the music folder."
                : !usage_                ? wearableProblem_
                : !attachment_.connected ? "The wearable is not connected."
                : !attachment_.onCharger && !ignoresCharger ? "The wearable is not on its charger."
                                                            : "";
    if (playlist == nullptr || !obstacle_.empty()) {
        return std::nullopt;
    }
    return Order{library_, selectionOf(*playlist), wearable_};
}

wearable::Selection Engine::selectionOf(const media::Playlist& playlist) const {
    return {playlist.id, playlist.revision, preferences_.get(preferences::assetSyncLimitType),
            preferences_.get(preferences::assetSyncLimit).value_or(0)};
}

/// A wearable that is not there does not say otherwise.
bool Engine::isSent(const wearable::Selection& selection) const {
    using namespace preferences;
    return (!usage_ || usage_->sent == selection) &&
           preferences_.get(lastFullySentAssetSyncPlaylistPersistentID) == selection.playlist &&
           preferences_.get(lastFullySentAssetSyncPlaylistVersion) == selection.revision;
}

bool Engine::isDue(const Order& order) const {
    return isStartRequested_ ||
           (LoopClock::now() >= settled_ && givenUp_ != order.selection && !isSent(order.selection));
}

/// Begins or ends a sync, where what is wished for asks for it.
void Engine::consider() {
    const auto wanted = currentOrder(run_ ? run_->ignoresCharger : isStartRequested_);
    if (run_ && !wanted) {
        stop(obstacle_);
    } else if (run_) {
        // Another revision of the playlist has its turn afterwards.
        auto selection = run_->order.selection;
        selection.revision = wanted->selection.revision;
        if (selection != wanted->selection || run_->order.wearable != wanted->wearable) {
            stop("Something else was chosen.");
        }
    } else if (wanted && isDue(*wanted)) {
        begin(*wanted);
    }
    publish();
}

void Engine::begin(Order order) {
    givenUp_.reset();
    run_ = std::make_unique<Run>(Run{order, std::exchange(isStartRequested_, false), {}, {}, {}});
    run_->session = std::make_unique<SessionObject>(loop_.bus(), ++sessions_, [this] { cancel(); });
    run_->thread = std::jthread{[this, order = std::move(order)](const std::stop_token& stop) {
        const SleepInhibitor awake;
        CopyProgress last;
        LoopClock::time_point told;
        const auto tell = [&](const CopyProgress& progress) {
            const bool isStep = progress.songs != last.songs || told == LoopClock::time_point{};
            if (!isStep && LoopClock::now() - told < timeBetweenUpdates) {
                return;
            }
            last = progress;
            told = LoopClock::now();
            loop_.post([this, progress] { run_->session->copied(progress); });
        };
        PosixSongSource songs;
        const SteadyClock clock;
        const SyncPorts ports{
            [](const auto& wearable) { return std::make_unique<PosixDevice>(wearable); }, songs,
            rate_, clock};
        const auto outcome = Sync(order, ports, stop, tell).run();
        loop_.post([this, outcome] { finish(outcome); });
    }};
}

void Engine::stop(const std::string& why) {
    if (run_->whyStopped.empty()) {
        run_->whyStopped = why;
    }
    run_->thread.request_stop();
}

void Engine::finish(const Outcome& outcome) {
    run_->thread.join();
    const auto order = run_->order;
    const bool isSent = outcome.kind == Outcome::Kind::Sent;
    const auto problem = isSent ? remember(order) : "";
    if (isSent && problem.empty()) {
        retry_.reset();
        conclude(true, outcome.message);
    } else if (outcome.kind == Outcome::Kind::Stopped) {
        conclude(false, run_->whyStopped);
    } else {
        givenUp_ = order.selection;
        if (run_->whyStopped.empty() && (isSent || outcome.mayPass)) {
            tryAgainLater();
        }
        conclude(false, isSent ? problem : outcome.message);
    }
    run_.reset();
    if (outcome.isLibraryStale) {
        folder_->rescan();
    }
    refreshWearable();
    consider();
}

/// Tells the result of the running session, here and on the bus.
void Engine::conclude(bool success, const std::string& message) {
    const LastResult result{success, message, microsecondsNow()};
    try {
        results_.remember(run_->order.wearable.root, result);
    } catch (const std::system_error& error) {
        std::cerr << "quorl-syncd: What became of the sync is forgotten when the engine ends ("
                  << error.what() << ").\n";
    }
    tellLastResult();
    run_->session->finish(success, message);
}

void Engine::tellLastResult() {
    const auto result = results_.of(wearable_.root);
    status_.lastSuccess = result.success;
    status_.lastMessage = result.message;
    status_.lastTime = result.time;
}

void Engine::tryAgainLater() {
    loop_.callAt(LoopClock::now() + retry_.next(), [this, failed = sessions_] {
        // Where there was another session since, that one counts.
        if (failed == sessions_) {
            givenUp_.reset();
            consider();
        }
    });
}

/// The last thing of all; gives back an empty text, or why it could not be done.
std::string Engine::remember(const Order& order) {
    using namespace preferences;
    const auto id =
        preferences_.set(lastFullySentAssetSyncPlaylistPersistentID, order.selection.playlist);
    if (!id.problem.empty()) {
        return id.problem;
    }
    if (usage_ && order.wearable == wearable_) {
        usage_->sent = order.selection;
    }
    return preferences_.set(lastFullySentAssetSyncPlaylistVersion, order.selection.revision)
        .problem;
}

/// Has clients told which playlist is to be synced, and how far that is.
void Engine::takeChoice() {
    const auto id = preferences_.get(preferences::assetSyncPlaylistPersistentID);
    const bool isWished = preferences_.get(preferences::assetSyncEnabled) && id;
    const auto* const playlist = isWished && library_ ? library_->playlist(*id) : nullptr;
    status_.playlistName = playlist ? playlist->name : "";
    status_.syncState = syncStateOf({.isWished = isWished,
                                     .isLibraryRead = library_ != nullptr,
                                     .isPlaylistThere = playlist != nullptr,
                                     .isSent = playlist && isSent(selectionOf(*playlist)),
                                     .isRunning = run_ != nullptr});
}

void Engine::publish() {
    takeChoice();
    status_.status = run_                ? "Syncing music."
                     : obstacle_.empty() ? "Everything is up to date."
                                         : obstacle_;
    if (!run_ && obstacle_.empty() && givenUp_) {
        status_.status = status_.lastMessage;
    }
    const auto usage = usage_.value_or(wearable::Usage{});
    wearableStatus_ = {
        .directory = wearable_.root,
        .name = wearable::wearableName,
        .isEmbedded = wearable_.isEmbedded(),
        .isConnected = usage_ && attachment_.connected,
        .isOnCharger = usage_ && attachment_.onCharger,
        .capacity = usage.capacity,
        .available = usage.available,
        .songs = usage.songs,
    };
    changed_();
}

} // namespace quorl::syncd
