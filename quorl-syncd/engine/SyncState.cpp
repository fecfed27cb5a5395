#include "quorl-syncd/engine/SyncState.h"

#include "services/engine/Names.h"

namespace quorl::syncd {

const char* syncStateOf(const SyncFacts& facts) {
    if (facts.isWished && !facts.isLibraryRead) {
        return engine::syncUnknown;
    }
    if (!facts.isWished || !facts.isPlaylistThere) {
        return engine::syncOff;
    }
    return facts.isRunning ? engine::syncSyncing
           : facts.isSent  ? engine::syncSynced
                           : engine::syncPending;
}

} // namespace quorl::syncd
