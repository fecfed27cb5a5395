#include "quorl/adapters/FoundWearables.h"

#include <algorithm>
#include <utility>

#include "platform/Dispatch.h"

namespace quorl {

namespace {

/// Has `act` called on the main queue with whom `reference` leads to, as long as that is there.
template <class Act>
void onMainQueue(const std::weak_ptr<FoundWearables*>& reference, Act act) {
    dispatch_async(dispatch_get_main_queue(), [reference, act = std::move(act)] {
        if (const auto self = reference.lock()) {
            act(**self);
        }
    });
}

} // namespace

FoundWearables::FoundWearables(Changed changed)
    : changed_(std::move(changed)),
      finder_(
          [reference = std::weak_ptr(self_)](const finding::Found& found) {
              onMainQueue(reference, [found](FoundWearables& self) { self.take(found); });
          },
          finding::homeDirectory()) {}

FoundWearables::~FoundWearables() = default;

std::vector<std::string> FoundWearables::safeToRemove() const {
    std::vector<std::string> names;
    for (const auto& offer : ejected_) {
        names.push_back(offer.name);
    }
    return names;
}

void FoundWearables::take(const finding::Found& found) {
    found_ = found;
    std::erase_if(ejected_, [&found](const finding::Offer& ejected) {
        return std::ranges::find(found.offers, ejected.directory, &finding::Offer::directory) !=
               found.offers.end();
    });
    changed_();
}

void FoundWearables::eject(const finding::Offer& offer, Done done) {
    if (ejection_ || !offer.removal) {
        return;
    }
    ejection_ = std::make_unique<base::Errand>(
        [reference = std::weak_ptr(self_), offer,
         done = std::move(done)](const std::stop_token& /*stop*/) {
            const auto problem =
                finding::remove(*offer.removal, offer.name, finding::connectToSystem);
            onMainQueue(reference, [offer, problem, done](FoundWearables& self) {
                self.endEjection(offer, problem, done);
            });
        },
        std::chrono::milliseconds(0));
}

void FoundWearables::endEjection(const finding::Offer& offer, const std::string& problem,
                                 const Done& done) {
    ejection_.reset();
    if (problem.empty()) {
        ejected_.push_back(offer);
        std::erase_if(found_->offers, [&offer](const finding::Offer& other) {
            return other.removal == offer.removal;
        });
    }
    done(problem);
    changed_();
}

} // namespace quorl
