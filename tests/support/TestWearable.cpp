#include "tests/support/TestWearable.h"

namespace quorl::tests {

class TestWearable::Connection final : public WearableConnection {
  public:
    explicit Connection(TestWearable& wearable) : wearable_(wearable) {}

    void requestUsage(LSSManager::UsageHandler reply) override {
        wearable_.journal_.note("wearable usage");
        wearable_.questions_.push_back(std::move(reply));
    }

  private:
    TestWearable& wearable_;
};

std::shared_ptr<WearableConnection> TestWearable::connect() {
    journal_.note("wearable connect");
    return std::make_shared<Connection>(*this);
}

LSSManager::UsageHandler TestWearable::takeQuestion() {
    auto question = std::move(questions_.at(0));
    questions_.pop_front();
    return question;
}

void TestWearable::reply(const Figures& figures) {
    std::map<std::string, std::shared_ptr<NSNumber>, std::less<>> usage;
    for (const auto& [key, bytes] : figures) {
        usage[key] = NSNumber::numberWithDouble(bytes);
    }
    takeQuestion()(std::make_shared<const decltype(usage)>(std::move(usage)), nullptr);
}

void TestWearable::reply(double available, double songs) {
    reply({{std::string(kLSSUsageAvailableStorageKey), available},
           {std::string(kLSSUsageSongsKey), songs}});
}

void TestWearable::fail(const std::string& problem) {
    takeQuestion()(nullptr, std::make_shared<NSError>(problem));
}

} // namespace quorl::tests
