#pragma once

#include "quorl-syncd/engine/ports/Announcer.h"
#include "quorl-syncd/engine/ports/ChoiceStore.h"
#include "quorl-syncd/engine/ports/MusicPort.h"
#include "quorl-syncd/engine/ports/ResultStore.h"
#include "quorl-syncd/engine/ports/SyncRunner.h"
#include "quorl-syncd/engine/ports/Turns.h"
#include "quorl-syncd/engine/ports/WearablePort.h"

namespace quorl::syncd {

/// All that the engine touches. Outlives it.
struct EnginePorts {
    Turns& turns;
    ChoiceStore& choices;
    MusicPort& music;
    WearablePort& wearables;
    SyncRunner& syncs;
    ResultStore& results;
    Announcer& announcer;
};

} // namespace quorl::syncd
