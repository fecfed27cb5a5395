#include "quorl/adapters/WearableUsage.h"

#include "platform/Dispatch.h"
#include "services/wearable/UsageReader.h"

namespace quorl {

namespace {

NSDictionary<NSNumber> usageOf(const wearable::Usage& usage) {
    using Usage = NSDictionary<NSNumber>::element_type;
    return std::make_shared<Usage>(
        Usage{{std::string(kLSSUsageAvailableStorageKey),
               NSNumber::numberWithUnsignedLongLong(usage.available)},
              {std::string(kLSSUsageSongsKey), NSNumber::numberWithUnsignedLongLong(usage.songs)}});
}

void pass(const wearable::UsageReader::Answer& answer, const LSSManager::UsageHandler& reply) {
    if (const auto* usage = std::get_if<wearable::Usage>(&answer)) {
        reply(usageOf(*usage), nullptr);
    } else {
        reply(nullptr, std::make_shared<NSError>(std::get<wearable::Unseen>(answer).sentence));
    }
}

} // namespace

struct WearableUsage::Questions {
    explicit Questions(const wearable::Wearable& wearable) : reader(wearable) {}

    wearable::UsageReader reader;
    int open = 0; ///< main thread only
};

class WearableUsage::Client final : public WearableConnection {
  public:
    explicit Client(std::shared_ptr<Questions> questions) : questions_(std::move(questions)) {}

    void requestUsage(LSSManager::UsageHandler reply) override {
        ++questions_->open;
        // Held weakly: the reader must not be destroyed on its own thread.
        questions_->reader.ask([reply = std::move(reply), reference = std::weak_ptr(questions_)](
                                   const wearable::UsageReader::Answer& answer) {
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

WearableUsage::WearableUsage(const wearable::Wearable& wearable)
    : questions_(std::make_shared<Questions>(wearable)) {}

std::shared_ptr<WearableConnection> WearableUsage::connect() const {
    return std::make_shared<Client>(questions_);
}

bool WearableUsage::isIdle() const { return questions_->open == 0; }

} // namespace quorl
