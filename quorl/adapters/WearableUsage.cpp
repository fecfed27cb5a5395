#include "quorl/adapters/WearableUsage.h"

#include "platform/Dispatch.h"
#include "services/engine/Message.h"
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
        reply(nullptr, std::make_shared<NSError>(
                           engine::sentence(std::get<wearable::Unseen>(answer).message)));
    }
}

} // namespace

struct WearableUsage::Questions {
    explicit Questions(const wearable::Wearable& wearable) : reader(wearable) {}

    wearable::UsageReader reader;
    int open = 0; ///< main thread only
};

/// The wearable that is asked.
struct WearableUsage::Chosen {
    std::shared_ptr<Questions> questions;
};

class WearableUsage::Client final : public WearableConnection {
  public:
    explicit Client(std::shared_ptr<Chosen> chosen) : chosen_(std::move(chosen)) {}

    void requestUsage(LSSManager::UsageHandler reply) override {
        const auto& asked = chosen_->questions;
        ++asked->open;
        // Held weakly: the reader must not be destroyed on its own thread.
        asked->reader.ask([reply = std::move(reply), reference = std::weak_ptr(asked)](
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
    std::shared_ptr<Chosen> chosen_;
};

WearableUsage::WearableUsage(const wearable::Wearable& wearable)
    : chosen_(std::make_shared<Chosen>()) {
    setWearable(wearable);
}

void WearableUsage::setWearable(const wearable::Wearable& wearable) {
    chosen_->questions = std::make_shared<Questions>(wearable);
}

std::shared_ptr<WearableConnection> WearableUsage::connect() const {
    return std::make_shared<Client>(chosen_);
}

bool WearableUsage::isIdle() const { return chosen_->questions->open == 0; }

} // namespace quorl
