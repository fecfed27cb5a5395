#include "quorl-simulate/parts/WatchfulAnnouncer.h"

#include <optional>

namespace quorl::simulation {

class WatchfulAnnouncer::Report final : public syncd::SessionReport {
  public:
    explicit Report(WatchfulAnnouncer& announcer) : announcer_(announcer) {
        if (++announcer_.sessions_ > 1) {
            announcer_.ears_.complain("two sessions at once");
        }
    }

    ~Report() override { --announcer_.sessions_; }

    void copied(const syncd::CopyProgress& now) override {
        if (isFinished_) {
            announcer_.ears_.complain("progress after the end of a session");
        }
        if (now.songs > now.totalSongs || now.bytes > now.totalBytes) {
            announcer_.ears_.complain("progress beyond the whole");
        }
        const bool goesBack =
            last_ && (now.songs < last_->songs || now.bytes < last_->bytes ||
                      now.totalSongs != last_->totalSongs || now.totalBytes != last_->totalBytes);
        if (goesBack) {
            announcer_.ears_.complain("progress that goes back");
        }
        last_ = now;
    }

    void finish(bool success, const std::string& message) override {
        if (isFinished_) {
            announcer_.ears_.complain("a session that ends twice");
        }
        isFinished_ = true;
        announcer_.ears_.finished(success, message);
    }

  private:
    WatchfulAnnouncer& announcer_;
    std::optional<syncd::CopyProgress> last_;
    bool isFinished_ = false;
};

std::unique_ptr<syncd::SessionReport>
WatchfulAnnouncer::beginSession(std::uint64_t /*number*/, std::function<void()> cancel) {
    cancel_ = std::move(cancel);
    ears_.begun();
    return std::make_unique<Report>(*this);
}

void WatchfulAnnouncer::cancel() const {
    if (isSessionThere()) {
        cancel_();
    }
}

} // namespace quorl::simulation
