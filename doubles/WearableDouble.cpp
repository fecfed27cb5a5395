#include "doubles/WearableDouble.h"

#include <utility>

namespace quorl {

namespace {

class Connection final : public WearableConnection {
  public:
    explicit Connection(WearableDouble& wearable) : wearable_(wearable) {}

    void requestUsage(LSSManager::UsageHandler reply) override {
        wearable_.request(std::move(reply));
    }

  private:
    WearableDouble& wearable_;
};

NSDictionary<NSNumber> dictionaryOf(const UsageFigures& figures) {
    std::map<std::string, std::shared_ptr<NSNumber>, std::less<>> usage;
    if (figures.available) {
        usage.emplace(kLSSUsageAvailableStorageKey, NSNumber::numberWithDouble(*figures.available));
    }
    if (figures.songs) {
        usage.emplace(kLSSUsageSongsKey, NSNumber::numberWithDouble(*figures.songs));
    }
    return std::make_shared<const decltype(usage)>(std::move(usage));
}

void tell(const LSSManager::UsageHandler& reply, const std::optional<UsageFigures>& figures) {
    if (figures) {
        reply(dictionaryOf(*figures), nullptr);
    } else {
        reply(nullptr, std::make_shared<NSError>("The wearable does not answer. Bring it closer."));
    }
}

} // namespace

std::shared_ptr<WearableConnection> WearableDouble::connect(dispatch_queue_t queue) {
    recorder_->wearableWillConnect(queue);
    return std::make_shared<Connection>(*this);
}

void WearableDouble::setAnswer(const UsageAnswer& answer) {
    answer_ = answer;
    if (!answer.isHeld) {
        for (auto& reply : std::exchange(held_, {})) {
            this->answer(std::move(reply));
        }
    }
}

void WearableDouble::holdReplies() {
    UsageAnswer held;
    held.isHeld = true;
    setAnswer(held);
}

LSSManager::UsageHandler WearableDouble::takeQuestion() {
    auto question = std::move(held_.at(0));
    held_.pop_front();
    return question;
}

void WearableDouble::reply(const UsageFigures& figures) { tell(takeQuestion(), figures); }

void WearableDouble::fail(const std::string& problem) {
    takeQuestion()(nullptr, std::make_shared<NSError>(problem));
}

void WearableDouble::request(LSSManager::UsageHandler reply) {
    recorder_->wearableWillBeAskedForUsage();
    if (answer_.isHeld) {
        held_.push_back(std::move(reply));
    } else {
        answer(std::move(reply));
    }
}

void WearableDouble::answer(LSSManager::UsageHandler reply) const {
    if (answer_.delay == 0) {
        tell(reply, answer_.figures);
        return;
    }
    // The answer is the one of the moment of asking; the closure owns the request until then.
    VirtualTime::shared().schedule(
        answer_.delay,
        [reply = std::move(reply), figures = answer_.figures] { tell(reply, figures); });
}

} // namespace quorl
