#include "quorl-syncd/daemon/ChosenWearable.h"

#include <mutex>
#include <utility>

#include "services/base/Paths.h"
#include "services/engine/Codes.h"
#include "services/engine/Message.h"
#include "services/finding/Chosen.h"
#include "services/finding/SystemFiles.h"
#include "services/preferences/ChosenPlaces.h"

namespace quorl::syncd {

namespace {

using preferences::wearableDirectory;
using preferences::wearableIdentity;

finding::Chosen chosenIn(const preferences::SharedPreferences& preferences) {
    return finding::chosenIn(preferences::chosenWearable(preferences),
                             preferences.get(wearableIdentity));
}

/// What is known, with what is mounted at this moment.
finding::Surroundings updated(const finding::Surroundings& known) {
    auto now = finding::surroundingsIn("/");
    now.drives = finding::joined(known.drives, now.drives);
    return now;
}

} // namespace

/// The chosen wearable, for the threads that look at it.
class ChosenWearable::Expected {
  public:
    void set(finding::Chosen chosen) {
        const std::scoped_lock lock(mutex_);
        chosen_ = std::move(chosen);
    }

    [[nodiscard]] finding::Chosen get() const {
        const std::scoped_lock lock(mutex_);
        return chosen_;
    }

    /// A directory that has nothing to do with the chosen drive is somebody's own business.
    [[nodiscard]] engine::Message objectionTo(const std::filesystem::path& directory) const {
        const auto chosen = get();
        if (!chosen.identity) {
            return {};
        }
        const auto now = finding::whereaboutsOf(chosen, finding::survey());
        if (now.directory == directory) {
            return now.problem;
        }
        return chosen.directory == directory ? engine::Message{engine::code::lookingForWearable}
                                             : engine::Message{};
    }

  private:
    mutable std::mutex mutex_;
    finding::Chosen chosen_;
};

ChosenWearable::ChosenWearable(engine::BusLoop& loop, preferences::SharedPreferences& preferences,
                               const std::string& other)
    : loop_(loop),
      preferences_(preferences),
      expected_(std::make_shared<Expected>()),
      isFollowed_(other.empty() || other == preferences::chosenWearable(preferences)) {
    expected_->set(chosenIn(preferences_));
}

ChosenWearable::~ChosenWearable() = default;

LocalWearables::Objection ChosenWearable::objection() const {
    return [expected = expected_](const std::filesystem::path& directory) {
        return expected->objectionTo(directory);
    };
}

void ChosenWearable::watch(Moved moved) {
    moved_ = std::move(moved);
    watch_.emplace([mailbox = loop_.mailbox(),
                    tell = lifeline_.whileThere([this](const finding::Surroundings& surroundings) {
                        take(surroundings);
                    })](const finding::Surroundings& surroundings) {
        mailbox->post([tell, surroundings] { tell(surroundings); });
    });
}

void ChosenWearable::readAgain() {
    isFollowed_ = true;
    expected_->set(chosenIn(preferences_));
    settle();
}

std::string ChosenWearable::remember(const std::string& directory) {
    const auto place = directory.empty() ? std::filesystem::path() : base::normal(directory);
    surroundings_ = finding::survey();
    const auto chosen = finding::chosenAt(place, surroundings_);
    const auto before = preferences_.get(wearableIdentity);
    auto problem = preferences_.set(wearableIdentity, finding::toText(chosen.identity)).problem;
    if (!problem.empty()) {
        return problem;
    }
    problem = preferences_.set(wearableDirectory, directory).problem;
    if (!problem.empty()) {
        static_cast<void>(preferences_.set(wearableIdentity, before));
        return problem;
    }
    readAgain();
    return {};
}

/// Where the path alone counts, nothing that is plugged in makes a difference.
void ChosenWearable::take(const finding::Surroundings& surroundings) {
    surroundings_ = surroundings;
    if (isFollowed_ && expected_->get().identity) {
        settle();
    }
}

void ChosenWearable::settle() {
    moved_(finding::whereaboutsOf(expected_->get(), updated(surroundings_)).directory);
}

} // namespace quorl::syncd
