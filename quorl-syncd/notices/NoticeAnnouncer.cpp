#include "quorl-syncd/notices/NoticeAnnouncer.h"

#include <utility>

namespace quorl::syncd {

/// Tells clients of a sync, and notes how it goes.
class NoticeAnnouncer::Report final : public SessionReport {
  public:
    Report(NoticeAnnouncer& announcer, std::unique_ptr<SessionReport> clients)
        : announcer_(announcer), clients_(std::move(clients)), began_(announcer.clock_.now()) {
        announcer_.brought_ = Brought::Nothing;
    }

    ~Report() override { announcer_.brought_ = Brought::Nothing; }

    Report(const Report&) = delete;
    Report& operator=(const Report&) = delete;

    void copied(const CopyProgress& progress) override {
        clients_->copied(progress);
        const bool isMore = thereAlready_ && progress.bytes > *thereAlready_;
        thereAlready_ = thereAlready_.value_or(progress.bytes);
        if (isMore && announcer_.brought_ == Brought::Nothing) {
            announcer_.brought_ = Brought::Songs;
            announcer_.consider();
        }
    }

    void finish(bool success, const std::string& message) override {
        announcer_.ended_ = {success, announcer_.brought_, announcer_.clock_.now() - began_};
        clients_->finish(success, message);
    }

  private:
    NoticeAnnouncer& announcer_;
    const std::unique_ptr<SessionReport> clients_;
    const Clock::TimePoint began_;
    std::optional<std::uint64_t> thereAlready_; ///< in bytes; nothing as long as it is not known
};

NoticeAnnouncer::NoticeAnnouncer(Announcer& clients, const Clock& clock, NoticeBoard& board)
    : clients_(clients), clock_(clock), board_(board) {}

void NoticeAnnouncer::follow(Status status) {
    status_ = std::move(status);
    memory_.lastTime = status_().lastTime;
}

void NoticeAnnouncer::setWatched(bool isWatched) {
    isWatched_ = isWatched;
    consider();
}

void NoticeAnnouncer::setWanted(bool isWanted) {
    isWanted_ = isWanted;
    consider();
}

void NoticeAnnouncer::stateDidChange() {
    clients_.stateDidChange();
    consider(std::exchange(ended_, std::nullopt));
}

std::unique_ptr<SessionReport> NoticeAnnouncer::beginSession(std::uint64_t number,
                                                             std::function<void()> cancel) {
    return std::make_unique<Report>(*this, clients_.beginSession(number, std::move(cancel)));
}

void NoticeAnnouncer::consider(const std::optional<EndedSync>& ended) {
    if (!status_) {
        return;
    }
    const auto before = shownBy(memory_);
    memory_ = recall(memory_, status_(), {ended, brought_, isWanted_ && !isWatched_});
    const auto now = shownBy(memory_);
    if (now && now != before) {
        board_.show(*now);
    } else if (!now && before) {
        board_.withdraw();
    }
}

} // namespace quorl::syncd
