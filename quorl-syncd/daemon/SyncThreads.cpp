#include "quorl-syncd/daemon/SyncThreads.h"

#include <optional>
#include <thread>
#include <utility>

#include "quorl-syncd/daemon/Lifeline.h"
#include "quorl-syncd/transfer/Sync.h"
#include "quorl-syncd/transfer/device/PosixVolume.h"

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

class SyncThread final : public RunningSync {
  public:
    SyncThread(engine::BusLoop& loop, SyncThreads::KeepAwake keepAwake, SyncPorts ports,
               Order order, SyncRunner::Copied copied, SyncRunner::Ended ended)
        : loop_(loop),
          keepAwake_(std::move(keepAwake)),
          ports_(std::move(ports)),
          order_(std::move(order)),
          copied_(std::move(copied)),
          ended_(std::move(ended)),
          thread_([this](const std::stop_token& stop) { run(stop); }) {}

    void stop() override { thread_.request_stop(); }

  private:
    void run(const std::stop_token& stop) {
        const auto awake = keepAwake_();
        ProgressFilter filter;
        Sync sync(order_, ports_, stop, [this, &filter](const CopyProgress& progress) {
            if (filter.isWorthTelling(progress, ports_.clock.now())) {
                post(copied_, progress);
            }
        });
        post(ended_, sync.run());
    }

    template <class Call, class Value>
    void post(const Call& call, const Value& value) {
        loop_.post([call = lifeline_.whileThere(call), value] { call(value); });
    }

    engine::BusLoop& loop_;
    const SyncThreads::KeepAwake keepAwake_;
    const SyncPorts ports_;
    const Order order_;
    const SyncRunner::Copied copied_;
    const SyncRunner::Ended ended_;
    const Lifeline lifeline_;

    // The last member, for it uses the others.
    std::jthread thread_;
};

} // namespace

SyncThreads::SyncThreads(engine::BusLoop& loop, KeepAwake keepAwake)
    : loop_(loop), keepAwake_(std::move(keepAwake)) {}

std::unique_ptr<RunningSync> SyncThreads::begin(const Order& order, Copied copied, Ended ended) {
    const SyncPorts ports{
        [](const auto& wearable) { return std::make_unique<PosixVolume>(wearable); }, songs_, rate_,
        clock_};
    return std::make_unique<SyncThread>(loop_, keepAwake_, ports, order, std::move(copied),
                                        std::move(ended));
}

} // namespace quorl::syncd
