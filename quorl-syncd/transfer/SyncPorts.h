#pragma once

#include <functional>
#include <memory>

#include "quorl-syncd/transfer/device/Volume.h"
#include "quorl-syncd/transfer/pace/Clock.h"
#include "quorl-syncd/transfer/pace/Throttle.h"
#include "quorl-syncd/transfer/songs/SongSource.h"
#include "services/wearable/Wearable.h"

namespace quorl::syncd {

/// All that a sync touches. The references outlive it.
struct SyncPorts {
    /// Throws `std::system_error` where the wearable cannot be opened, `SyncProblem`, or another
    /// `std::exception` whose text is a sentence for the user.
    std::function<std::unique_ptr<Volume>(const wearable::Wearable&)> openVolume;
    SongSource& songs;
    Throttle& throttle;
    /// Only for how many songs are brought onto the device at once.
    const Clock& clock;
};

} // namespace quorl::syncd
