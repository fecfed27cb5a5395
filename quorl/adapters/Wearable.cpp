#include "quorl/adapters/Wearable.h"

#include "platform/Dispatch.h"
#include "services/wearable/Reporter.h"

namespace quorl {

namespace {

NSDictionary<NSNumber> usageOf(const wearable::Report& report) {
    using Usage = NSDictionary<NSNumber>::element_type;
    return std::make_shared<Usage>(Usage{
        {std::string(kLSSUsageAvailableStorageKey),
         NSNumber::numberWithUnsignedLongLong(report.available)},
        {std::string(kLSSUsageSongsKey), NSNumber::numberWithUnsignedLongLong(report.songs)}});
}

void pass(const wearable::Reporter::Answer& answer, const LSSManager::UsageHandler& reply) {
    if (const auto* report = std::get_if<wearable::Report>(&answer)) {
        reply(usageOf(*report), nullptr);
    } else {
        reply(nullptr, std::make_shared<NSError>(std::get<std::string>(answer)));
    }
}

} // namespace

struct Wearable::Questions {
    explicit Questions(const wearable::Wearable& wearable) : reporter(wearable) {}

    wearable::Reporter reporter;
    int open = 0; ///< main thread only
};

class Wearable::Client final : public LSSClient {
  public:
    explicit Client(std::shared_ptr<Questions> questions) : questions_(std::move(questions)) {}

    void requestUsage(LSSManager::UsageHandler reply) override {
        ++questions_->open;
        // Held weakly: the reporter must not be destroyed on its own thread.
        questions_->reporter.ask([reply = std::move(reply), reference = std::weak_ptr(questions_)](
                                     const wearable::Reporter::Answer& answer) {
            pass(answer, reply);
            dispatch_async(dispatch_get_main_queue(), [reference] {
                if (const auto questions = reference.lock()) {
                    --questions->open;
                }
            });
        });
    }

  private:
    std::shared_ptr<Questions> questions_;
};

Wearable::Wearable(const wearable::Wearable& wearable)
    : questions_(std::make_shared<Questions>(wearable)) {}

std::unique_ptr<LSSClient> Wearable::connect() const {
    return std::make_unique<Client>(questions_);
}

bool Wearable::isIdle() const { return questions_->open == 0; }

} // namespace quorl
