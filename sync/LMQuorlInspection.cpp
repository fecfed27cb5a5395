// What this plug-in shows to hosts that try it out.

#include "platform/Inspection.h"
#include "sync/LMQuorlSyncManager.h"
#include "sync/LMSyncDefaults+Extras.h"

namespace {

const LMQuorlSyncManager& manager() { return *LMQuorlSyncManager::sharedManager(); }

constexpr QuorlInspection inspection{
    .syncStage = []() -> NSInteger { return manager().syncStage(); },
    .progress = [] { return manager().progress(); },
    .completedAssetCount = [] { return manager().completedAssetCount(); },
    .totalAssetCount = [] { return manager().totalAssetCount(); },
    .assetSyncPlaylist = [] { return assetSyncPlaylist(LMSyncDefaults::sharedDefaults()); },
};

} // namespace

QUORL_EXPORT_INSPECTION(inspection)
