#include "quorl-syncd/daemon/SyncThreads.h"

#include <optional>
#include <system_error>
#include <utility>

#include "quorl-syncd/daemon/Lifeline.h"
#include "quorl-syncd/transfer/Messages.h"
#include "quorl-syncd/transfer/Sync.h"
#include "quorl-syncd/transfer/device/PosixVolume.h"
#include "quorl-syncd/transfer/pace/RateLimit.h"
#include "quorl-syncd/transfer/pace/SteadyClock.h"
#include "quorl-syncd/transfer/songs/PosixSongSource.h"
#include "services/base/Errand.h"

namespace quorl::syncd {

namespace {

/// Passes on progress so seldom that it does not cost much, but every song.
class ProgressFilter {
  public:
    [[nodiscard]] bool isWorthTelling(const CopyProgress& progress, Clock::TimePoint now) {
        constexpr std::chrono::milliseconds timeBetweenUpdates{100};
        const bool isWorth =
            !told_ || progress.songs != songs_ || now - *told_ >= timeBetweenUpdates;
        if (isWorth) {
            songs_ = progress.songs;
            told_ = now;
        }
        return isWorth;
    }

  private:
    std::uint64_t songs_ = 0;
    std::optional<Clock::TimePoint> told_;
};

/// Where a sync tells of itself, also when nobody listens any more.
class Told {
  public:
    Told(std::shared_ptr<engine::Mailbox> mailbox, SyncRunner::Copied copied,
         SyncRunner::Ended ended)
        : mailbox_(std::move(mailbox)), copied_(std::move(copied)), ended_(std::move(ended)) {}

    void copied(const CopyProgress& progress) const {
        mailbox_->post([copied = copied_, progress] { copied(progress); });
    }

    void ended(const Outcome& outcome) const {
        mailbox_->post([ended = ended_, outcome] { ended(outcome); });
    }

  private:
    std::shared_ptr<engine::Mailbox> mailbox_;
    SyncRunner::Copied copied_;
    SyncRunner::Ended ended_;
};

} // namespace

/// Shared with the threads of syncs that were left behind.
struct SyncThreads::Means {
    explicit Means(KeepAwake given) : keepAwake(std::move(given)) {}

    KeepAwake keepAwake;
    PosixSongSource songs;
    RateLimit rate;
    const SteadyClock clock;

    [[nodiscard]] SyncPorts ports() {
        return {[](const auto& wearable) { return std::make_unique<PosixVolume>(wearable); }, songs,
                rate, clock};
    }

    /// On the thread of a sync.
    void run(const Order& order, const std::stop_token& stop, const Told& told) {
        const auto awake = keepAwake();
        ProgressFilter filter;
        Sync sync(order, ports(), stop, [&](const CopyProgress& progress) {
            if (filter.isWorthTelling(progress, clock.now())) {
                told.copied(progress);
            }
        });
        told.ended(sync.run());
    }
};

namespace {

class SyncThread final : public RunningSync {
  public:
    /// Throws `std::system_error` where no thread can be started.
    SyncThread(const std::function<void(const std::stop_token&, const Told&)>& run,
               const std::shared_ptr<engine::Mailbox>& mailbox, const SyncRunner::Copied& copied,
               const SyncRunner::Ended& ended)
        : told_(mailbox, lifeline_.whileThere(copied), lifeline_.whileThere(ended)),
          errand_([run, told = told_](const std::stop_token& stop) { run(stop, told); }, patience) {
    }

    void stop() override { errand_.stop(); }

  private:
    static constexpr std::chrono::seconds patience{2};

    const Lifeline lifeline_;
    const Told told_;
    base::Errand errand_;
};

class NoSync final : public RunningSync {
  public:
    NoSync(engine::BusLoop& loop, const SyncRunner::Ended& ended, const std::error_code& why) {
        const Outcome outcome{Outcome::Kind::Failed, notSynced(why), false, true};
        loop.post([ended = lifeline_.whileThere(ended), outcome] { ended(outcome); });
    }

    void stop() override {}

  private:
    const Lifeline lifeline_;
};

} // namespace

SyncThreads::SyncThreads(engine::BusLoop& loop, KeepAwake keepAwake)
    : loop_(loop), means_(std::make_shared<Means>(std::move(keepAwake))) {}

SyncThreads::~SyncThreads() = default;

std::unique_ptr<RunningSync> SyncThreads::begin(const Order& order, Copied copied, Ended ended) {
    const auto run = [means = means_, order](const std::stop_token& stop, const Told& told) {
        means->run(order, stop, told);
    };
    try {
        return std::make_unique<SyncThread>(run, loop_.mailbox(), copied, ended);
    } catch (const std::system_error& error) {
        return std::make_unique<NoSync>(loop_, ended, error.code());
    }
}

void SyncThreads::setRateLimit(std::uint64_t bytesPerSecond) { means_->rate.set(bytesPerSecond); }

} // namespace quorl::syncd
