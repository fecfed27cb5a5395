#include "quorl-syncd/engine/AttachedWearable.h"

#include <iostream>
#include <utility>
#include <variant>

#include "quorl-syncd/engine/NotReady.h"
#include "services/base/Utf8.h"
#include "services/engine/Codes.h"
#include "services/language/Translated.h"

namespace quorl::syncd {

AttachedWearable::AttachedWearable(WearablePort& port, Changed changed)
    : port_(port), changed_(std::move(changed)) {}

AttachedWearable::~AttachedWearable() { saveLastWish(); }

void AttachedWearable::choose(const std::string& directory) {
    auto watched = port_.watch(directory, [this](WearableNews news) { notice(news); });
    saveLastWish();
    watched_ = std::move(watched);
    identity_ = watched_->identity();
    saved_.reset();
    wished_ = {};
    saving_.reset();
    wasThere_ = false;
    forget();
    refresh();
}

void AttachedWearable::refresh() {
    watched_->look([this, asked = changes_](const WatchedWearable::Answer& answer) {
        if (asked == changes_) {
            take(answer);
        }
    });
}

void AttachedWearable::attach(const wearable::AttachmentChange& change) {
    if (!identity_.isEmbedded()) {
        throw NotReady(
            language::translated("This wearable is a device; plug it in or out instead."));
    }
    wished_.connected = change.connected ? change.connected : wished_.connected;
    wished_.onCharger = change.onCharger ? change.onCharger : wished_.onCharger;
    save();
}

wearable::Attachment AttachedWearable::attachment() const {
    return wished_.appliedTo(saved_.value_or(wearable::Attachment()));
}

/// One at a time, so that of many wishes in a row only the last one is saved.
void AttachedWearable::save() {
    if (!saved_ || saving_ || *saved_ == attachment()) {
        return;
    }
    saving_ = attachment();
    watched_->save(wished_, [this, saving = attachment()](const std::string& problem) {
        wasSaved(saving, problem);
    });
}

/// Nobody is there any more to hear what becomes of it.
void AttachedWearable::saveLastWish() {
    const bool isSaved = saved_ ? saving_.value_or(*saved_) == attachment()
                                : !wished_.connected && !wished_.onCharger;
    if (!isSaved) {
        watched_->save(wished_, [](const std::string& /*problem*/) {});
    }
}

void AttachedWearable::wasSaved(const wearable::Attachment& attachment,
                                const std::string& problem) {
    saving_.reset();
    if (problem.empty()) {
        saved_ = attachment;
        save();
        return;
    }
    std::cerr << "quorl-syncd: " << base::printable(problem) << '\n';
    wished_ = {};
    changed_(Change::Figures);
}

void AttachedWearable::wasSent(const wearable::Selection& selection) {
    ++changes_;
    if (usage_) {
        usage_->sent = selection;
    }
}

engine::WearableStatus AttachedWearable::status() const {
    const auto usage = usage_.value_or(wearable::Usage());
    const auto attached = attachment();
    return {identity_.root,
            wearable::wearableName,
            identity_.isEmbedded(),
            usage_ && attached.connected,
            usage_ && attached.onCharger,
            usage.capacity,
            usage.available,
            usage.songs,
            usage.songCount};
}

engine::Message AttachedWearable::problem() const {
    return isLookedFor_ ? engine::Message{engine::code::lookingForWearable} : problem_.message;
}

void AttachedWearable::forget() {
    ++changes_;
    usage_.reset();
    problem_ = {};
    isLookedFor_ = true;
}

void AttachedWearable::notice(WearableNews news) {
    if (news == WearableNews::MayHaveChanged) {
        changed_(Change::Contents);
        return;
    }
    forget();
    refresh();
    changed_(Change::Figures);
}

void AttachedWearable::take(const WatchedWearable::Answer& answer) {
    isLookedFor_ = false;
    if (const auto* const sight = std::get_if<Sight>(&answer)) {
        changed_(takeSight(*sight));
        return;
    }
    wasThere_ = false;
    usage_.reset();
    problem_ = std::get<wearable::Unseen>(answer);
    changed_(Change::Figures);
}

AttachedWearable::Change AttachedWearable::takeSight(const Sight& sight) {
    const bool isSame = std::exchange(wasThere_, true) && identity_ == sight.identity;
    identity_ = sight.identity;
    usage_ = sight.usage;
    problem_ = {};
    if (!saved_) {
        saved_ = sight.attachment;
        save();
    }
    return isSame ? Change::Figures : Change::IsThereAgain;
}

} // namespace quorl::syncd
