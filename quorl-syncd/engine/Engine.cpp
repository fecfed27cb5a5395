#include "quorl-syncd/engine/Engine.h"

#include <iostream>
#include <system_error>
#include <utility>

#include "services/engine/Codes.h"
#include "services/language/Translated.h"

namespace quorl::syncd {

using language::filled;
using language::toTranslate;
using language::translated;

namespace {

using namespace std::chrono_literals;

namespace code = engine::code;

/// The app writes several values for one choice.
constexpr auto quietTime = 200ms;

/// A sync that has not moved for so long may be waiting for a device that hangs.
constexpr auto stallTime = 10s;

/// Does what takes a thread or a file of this process.
/// @param complaint where that cannot be had, in English.
template <class Act>
void requireMeans(const char* complaint, Act act) {
    try {
        act();
    } catch (const std::system_error& error) {
        throw NotReady(filled(translated(complaint), {{"reason", error.code().message()}}));
    }
}

} // namespace

Engine::Engine(const EnginePorts& ports, const EngineSettings& settings)
    : ports_(ports),
      wearable_(ports.wearables,
                [this](AttachedWearable::Change change) { wearableDidChange(change); }),
      retry_(settings.retryDelay),
      lookDelay_(settings.retryDelay) {
    status_.rateLimit = settings.rateLimit;
    setWearableDirectory(settings.wearableDirectory);
    setMusicFolder(settings.musicFolder);
}

Engine::~Engine() {
    if (!ongoing_) {
        return;
    }
    stop({code::ended});
    ongoing_->sync.reset();
    try {
        conclude(false, *ongoing_->whyStopped);
    } catch (const std::runtime_error&) {
        // There is nobody to tell any more.
    }
}

void Engine::choicesDidChange() {
    isRemovalRequested_ = isRemovalRequested_ && !ports_.choices.read().isSyncEnabled;
    givenUp_.reset();
    quietFrom_ = ports_.turns.now() + quietTime;
    ports_.turns.callAt(quietFrom_, [this] { consider(); });
    refreshWearable();
    consider();
}

void Engine::startNow() {
    if (ongoing_) {
        return;
    }
    auto asked = situation();
    asked.isStartRequested = true;
    if (const auto obstacle = obstacleIn(asked)) {
        throw NotReady(*obstacle);
    }
    isStartRequested_ = true;
    consider();
}

void Engine::cancel() {
    if (ongoing_) {
        givenUp_ = ongoing_->order.selection;
        stop({code::cancelled});
        publish();
    }
}

void Engine::removeMusic() {
    if (!wearable_.usage()) {
        throw NotReady(wearable_.problem());
    }
    if (!wearable_.attachment().connected) {
        throw NotReady(engine::Message{code::notConnected});
    }
    if (const auto problem = ports_.choices.switchOff(); !problem.empty()) {
        throw NotReady(problem);
    }
    isRemovalRequested_ = true;
    consider();
}

void Engine::setMusicFolder(const std::string& path) {
    const auto folder = path.empty() ? ports_.music.usualFolder() : path;
    constexpr auto complaint = toTranslate(
        "The music folder cannot be watched: {reason}. Close some programs, then try again.");
    requireMeans(complaint, [&] {
        music_ = ports_.music.watch(folder, [this](auto inventory) {
            inventory_ = std::move(inventory);
            consider();
        });
    });
    status_.musicFolder = folder;
    inventory_.reset();
    consider();
}

void Engine::setRateLimit(std::uint64_t bytesPerSecond) {
    status_.rateLimit = bytesPerSecond;
    applyRateLimit();
    publish();
}

void Engine::setWearableDirectory(const std::string& path) {
    constexpr auto complaint = toTranslate(
        "The wearable cannot be watched: {reason}. Close some programs, then try again.");
    requireMeans(complaint, [&] { wearable_.choose(path); });
    givenUp_.reset();
    isRemovalRequested_ = false; // it was for the other one
    tellLastResult();
    applyRateLimit();
    consider();
}

void Engine::attach(const wearable::AttachmentChange& change) {
    wearable_.attach(change);
    givenUp_.reset();
    consider();
}

void Engine::wearableDidChange(AttachedWearable::Change change) {
    switch (change) {
    case AttachedWearable::Change::Contents:
        // It is looked at after a sync anyway, which changes much by itself.
        if (!ongoing_) {
            refreshWearable();
        }
        return;
    case AttachedWearable::Change::IsThereAgain:
        givenUp_.reset();
        isRemovalRequested_ = false; // it may be another one
        break;
    case AttachedWearable::Change::Figures:
        break;
    }
    if (!wearable_.usage() && !wearable_.isLookedFor()) {
        lookAgainLater();
    }
    consider();
}

Situation Engine::situation() const {
    Situation now;
    now.choices = ports_.choices.read();
    now.isMusicRead = inventory_ != nullptr;
    if (inventory_ && now.choices.playlist) {
        const auto* const playlist = inventory_->playlist(*now.choices.playlist);
        now.revision = playlist ? std::optional(playlist->revision) : std::nullopt;
    }
    now.wearable = wearable_.identity();
    now.attachment = wearable_.attachment();
    now.usage = wearable_.usage();
    now.wearableProblem = wearable_.problem();
    now.isWearableLookedFor = wearable_.isLookedFor();
    if (ongoing_) {
        now.running = {ongoing_->order.selection, ongoing_->order.wearable, ongoing_->charger,
                       ongoing_->whyStopped};
    }
    now.isStartRequested = isStartRequested_;
    now.isRemovalRequested = isRemovalRequested_;
    now.givenUp = givenUp_;
    now.leftOutCount = shortfall_.leftOutCount;
    now.now = ports_.turns.now();
    now.quietFrom = quietFrom_;
    return now;
}

/// Begins or ends a sync, where what is wished for asks for it.
void Engine::consider() {
    countShortfall();
    const auto now = situation();
    const auto decision = decide(now);
    const auto problem = isClaimToBeForgotten(now, decision) ? ports_.choices.forgetSent() : "";
    switch (decision.kind) {
    case Decision::Kind::Rest:
        isRemovalRequested_ = false; // the wearable has gone
        break;
    case Decision::Kind::Continue:
        break;
    case Decision::Kind::Begin:
        if (problem.empty()) {
            begin(decision.selection);
        } else {
            putOff(decision.selection, problem);
        }
        break;
    case Decision::Kind::Stop:
        stop(decision.message);
        break;
    }
    publish();
}

void Engine::begin(const wearable::Selection& selection) {
    givenUp_.reset();
    const bool isRequested = std::exchange(isStartRequested_, false);
    const auto library = inventory_ ? inventory_ : std::make_shared<const media::Inventory>();
    const Order order{library, selection, wearable_.identity()};
    auto session = ports_.announcer.beginSession(++sessions_, [this] { cancel(); });
    auto sync = ports_.syncs.begin(
        order,
        [this](const CopyProgress& progress) {
            ongoing_->hasMoved = true;
            ongoing_->session->copied(progress);
        },
        [this](const Outcome& outcome) { finish(outcome); });
    ongoing_ = Ongoing{order,
                       isRequested ? Charger::Ignored : Charger::Needed,
                       {},
                       false,
                       std::move(session),
                       std::move(sync)};
    noteStall(sessions_);
}

/// What hangs with its device cannot say so itself.
void Engine::noteStall(std::uint64_t session) {
    ports_.turns.callAt(ports_.turns.now() + stallTime, [this, session] {
        if (!ongoing_ || session != sessions_) {
            return;
        }
        const bool isStalled = !std::exchange(ongoing_->hasMoved, false);
        if (isStalled && isHopeless()) {
            abandon();
            return;
        }
        if (isStalled) {
            refreshWearable();
        }
        noteStall(session);
    });
}

/// Whether nobody waits any more for the sync, which was asked to end.
bool Engine::isHopeless() const {
    return ongoing_->whyStopped &&
           (wearable_.isSilent() || ongoing_->order.wearable.root != wearable_.identity().root);
}

void Engine::stop(const engine::Message& why) {
    if (!ongoing_->whyStopped) {
        ongoing_->whyStopped = why;
    }
    ongoing_->sync->stop();
}

void Engine::abandon() {
    conclude(false, *ongoing_->whyStopped);
    ongoing_.reset();
    consider();
}

void Engine::finish(const Outcome& outcome) {
    const auto selection = ongoing_->order.selection;
    const bool isSent = outcome.kind == Outcome::Kind::Sent && !ongoing_->order.isRemoval();
    const auto problem = isSent ? remember(ongoing_->order) : "";
    const auto conclusion = conclusionOf(outcome, problem, ongoing_->whyStopped);
    if (conclusion.success) {
        retry_.reset();
        givenUp_.reset(); // it was cancelled too late
    }
    if (conclusion.isGivenUp) {
        givenUp_ = selection;
    }
    if (conclusion.isTriedAgain) {
        tryAgainLater();
    }
    if (outcome.kind != Outcome::Kind::Stopped) {
        tried_ = {selection, outcome.songProblems};
        countedFor_.reset();
    }
    conclude(conclusion.success, conclusion.message);
    if (ongoing_->order.isRemoval()) {
        isRemovalRequested_ = false; // whatever became of it
    }
    ongoing_.reset();
    if (outcome.isLibraryStale) {
        music_->rescan();
    }
    refreshWearable();
    consider();
}

/// The last thing of all; gives back an empty text, or why it could not be done.
std::string Engine::remember(const Order& order) {
    if (order.wearable == wearable_.identity()) {
        wearable_.wasSent(order.selection);
    }
    return ports_.choices.rememberSent({order.selection.playlist, order.selection.revision});
}

/// Tells the result of the sync that has ended, here and to clients.
void Engine::conclude(bool success, const engine::Message& message) {
    keepResult(ongoing_->order.wearable.root, success, message);
    ongoing_->session->finish(success, engine::sentence(message));
}

/// A sync cannot begin as long as it is said that everything was sent.
void Engine::putOff(const wearable::Selection& selection, const std::string& why) {
    isStartRequested_ = false;
    isRemovalRequested_ = false;
    givenUp_ = selection;
    tryAgainLater();
    keepResult(wearable_.identity().root, false, engine::other(why));
}

void Engine::keepResult(const std::string& wearable, bool success, const engine::Message& message) {
    try {
        const auto now = ports_.turns.calendarTime();
        const bool isComplete = success && message.code != code::removed;
        const auto complete = isComplete ? now : ports_.results.of(wearable).lastComplete;
        ports_.results.remember(wearable, {success, message, now, complete});
    } catch (const std::system_error& error) {
        std::cerr
            << "quorl-syncd: "
            << filled(translated(
                          "What became of the sync is forgotten when the engine ends ({reason})."),
                      {{"reason", error.what()}})
            << '\n';
    }
    tellLastResult();
}

void Engine::tellLastResult() {
    const auto result = ports_.results.of(wearable_.identity().root);
    status_.lastSuccess = result.success;
    status_.lastMessage = engine::sentence(result.message);
    status_.lastCode = result.message.code;
    status_.lastArguments = result.message.arguments;
    status_.lastTime = result.time;
    status_.lastComplete = result.lastComplete;
}

void Engine::tryAgainLater() {
    ports_.turns.callAt(ports_.turns.now() + retry_.next(), [this, failed = sessions_] {
        // Where there was another session since, that one counts.
        if (failed == sessions_) {
            givenUp_.reset();
            consider();
        }
    });
}

/// Not everything that is in the way tells when it is gone.
void Engine::lookAgainLater() {
    if (std::exchange(isLookDue_, true)) {
        return;
    }
    ports_.turns.callAt(ports_.turns.now() + lookDelay_, [this] {
        isLookDue_ = false;
        if (!wearable_.usage()) {
            refreshWearable();
        }
    });
}

void Engine::applyRateLimit() {
    ports_.syncs.setRateLimit(wearable_.identity().isEmbedded() ? status_.rateLimit : 0);
}

/// Nothing where none is wished for, or where the playlist is not there.
std::optional<Order> Engine::wishedOrder() const {
    const auto choices = ports_.choices.read();
    const bool isWished = choices.isSyncEnabled && choices.playlist && inventory_;
    const auto* const playlist = isWished ? inventory_->playlist(*choices.playlist) : nullptr;
    if (!playlist) {
        return std::nullopt;
    }
    return Order{inventory_,
                 {playlist->id, playlist->revision, choices.limitType, choices.limit},
                 wearable_.identity()};
}

/// Counting takes a while with a long playlist.
void Engine::countShortfall() {
    const auto order = wishedOrder();
    const auto wished = order ? std::optional(order->selection) : std::nullopt;
    if (wished == countedFor_ && inventory_ == countedIn_) {
        return;
    }
    const auto isTried = order && order->selection == tried_.selection;
    shortfall_ =
        order ? shortfallOf(*order, isTried ? tried_.problems : SongProblems()) : Shortfall();
    countedFor_ = wished;
    countedIn_ = inventory_;
}

void Engine::publish() {
    countShortfall();
    const auto now = situation();
    const auto status = statusOf(now, {status_.lastCode, status_.lastArguments});
    status_.status = engine::sentence(status);
    status_.statusCode = status.code;
    status_.statusArguments = status.arguments;
    status_.syncState = syncStateOf(now);
    const auto order = wishedOrder();
    status_.playlistName = order ? order->playlist().name : "";
    status_.playlistID = now.choices.isSyncEnabled ? now.choices.playlist.value_or(0) : 0;
    status_.leftOut = shortfall_.leftOut;
    status_.leftOutCount = shortfall_.leftOutCount;
    status_.beyondLimit = shortfall_.beyondLimit;
    status_.limitType = now.choices.limitType;
    status_.limit = now.choices.limit;
    ports_.announcer.stateDidChange();
}

} // namespace quorl::syncd
