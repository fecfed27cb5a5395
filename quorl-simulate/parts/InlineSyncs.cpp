#include "quorl-simulate/parts/InlineSyncs.h"

#include "quorl-syncd/transfer/Sync.h"

namespace quorl::simulation {

namespace {

struct Inline final : syncd::RunningSync {
    explicit Inline(std::stop_source source) : source_(std::move(source)) {}

    void stop() override { source_.request_stop(); }

    std::stop_source source_;
};

} // namespace

std::unique_ptr<syncd::RunningSync> InlineSyncs::begin(const syncd::Order& order, Copied copied,
                                                       Ended ended) {
    stop_ = std::stop_source();
    turns_.call([this, order, copied = std::move(copied), ended = std::move(ended)] {
        run(order, copied, ended);
    });
    return std::make_unique<Inline>(stop_);
}

void InlineSyncs::run(const syncd::Order& order, const Copied& copied, const Ended& ended) {
    isRunning_ = true;
    const auto stop = stop_.get_token();
    syncd::Sync sync(order, ports_, stop, [&](const syncd::CopyProgress& progress) {
        turns_.call([copied, progress] { copied(progress); });
    });
    auto outcome = sync.run();
    isRunning_ = false;
    ended_();
    if (isTooEarly_ && !stop.stop_requested()) {
        outcome = {syncd::Outcome::Kind::Sent, engine::other("Sent."), false, false};
    }
    turns_.call([ended, outcome] { ended(outcome); });
}

} // namespace quorl::simulation
