#pragma once

#include <cstdint>
#include <optional>

#include "quorl-syncd/engine/Choices.h"
#include "quorl-syncd/transfer/pace/Clock.h"
#include "services/engine/Message.h"
#include "services/wearable/Attachment.h"
#include "services/wearable/Manifest.h"
#include "services/wearable/Usage.h"
#include "services/wearable/Wearable.h"

namespace quorl::syncd {

enum class Charger { Needed, Ignored };

/// Everything that it rests on whether to sync, at one moment.
struct Situation {
    /// A sync that is under way.
    struct Running {
        wearable::Selection selection;
        wearable::Wearable wearable;
        Charger charger = Charger::Needed;
        /// Nothing as long as nobody has asked it to end.
        std::optional<engine::Message> whyStopped = {};

        bool operator==(const Running&) const = default;
    };

    Choices choices;

    bool isMusicRead = false;
    /// Of the chosen playlist; nothing where it is not in the music folder.
    std::optional<std::uint64_t> revision;

    wearable::Wearable wearable;
    wearable::Attachment attachment;
    /// Nothing while the wearable is not there or was not looked at yet; then `wearableProblem`
    /// says why.
    std::optional<wearable::Usage> usage;
    engine::Message wearableProblem;
    /// It may have become another one, and there was no answer since.
    bool isWearableLookedFor = false;

    std::optional<Running> running;
    /// Somebody has asked for a sync now, whether there is a reason for one or not.
    bool isStartRequested = false;
    /// Somebody has asked for our music to be removed, and sync was switched off for it.
    bool isRemovalRequested = false;
    /// Did not work, or was cancelled, and is not tried again for now.
    std::optional<wearable::Selection> givenUp;
    /// Of the chosen playlist: what it names and cannot be sent.
    std::uint64_t leftOutCount = 0;

    Clock::TimePoint now;
    /// From when on the preferences are thought to stay as they are: the app writes several for one
    /// choice.
    Clock::TimePoint quietFrom;

    bool operator==(const Situation&) const = default;
};

} // namespace quorl::syncd
