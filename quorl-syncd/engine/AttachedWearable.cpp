#include "quorl-syncd/engine/AttachedWearable.h"

#include <system_error>
#include <utility>
#include <variant>

#include "quorl-syncd/engine/NotReady.h"

namespace quorl::syncd {

AttachedWearable::AttachedWearable(WearablePort& port, Changed changed)
    : port_(port), changed_(std::move(changed)) {}

void AttachedWearable::choose(const std::string& directory) {
    auto watched = port_.watch(directory, [this](WearableNews news) { notice(news); });
    attachment_ = watched->attachment();
    watched_ = std::move(watched);
    usage_.reset();
    problem_ = "Looking for the wearable…";
    refresh();
}

void AttachedWearable::refresh() {
    watched_->look([this](const WatchedWearable::Answer& answer) { take(answer); });
}

void AttachedWearable::attach(const wearable::Attachment& attachment) {
    if (!identity().isEmbedded()) {
        throw NotReady("This wearable is a device; plug it in or out instead.");
    }
    try {
        watched_->save(attachment);
    } catch (const std::system_error& error) {
        throw NotReady("The wearable could not remember it: " + error.code().message() + ".");
    }
    attachment_ = attachment;
}

void AttachedWearable::wasSent(const wearable::Selection& selection) {
    if (usage_) {
        usage_->sent = selection;
    }
}

engine::WearableStatus AttachedWearable::status() const {
    const auto usage = usage_.value_or(wearable::Usage());
    return {identity().root,
            wearable::wearableName,
            identity().isEmbedded(),
            usage_ && attachment_.connected,
            usage_ && attachment_.onCharger,
            usage.capacity,
            usage.available,
            usage.songs};
}

void AttachedWearable::notice(WearableNews news) {
    switch (news) {
    case WearableNews::MayHaveChanged:
        refresh();
        break;
    case WearableNews::WasMounted:
        changed_(Change::BecameAnother);
        break;
    }
}

void AttachedWearable::take(const WatchedWearable::Answer& answer) {
    const bool wasThere = usage_.has_value();
    if (const auto* const usage = std::get_if<wearable::Usage>(&answer)) {
        usage_ = *usage;
    } else {
        usage_.reset();
        problem_ = std::get<std::string>(answer);
    }
    changed_(usage_ && !wasThere ? Change::IsThereAgain : Change::Figures);
}

} // namespace quorl::syncd
