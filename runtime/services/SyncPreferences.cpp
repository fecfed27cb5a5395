#include "platform/SyncPreferences.h"

#include "runtime/host/Host.h"

const NSNotificationName LMSyncPreferencesDidChangeNotification =
    "LMSyncPreferencesDidChangeNotification";

LMSyncDefaults& LMSyncDefaults::sharedDefaults() { return quorl::Host::required().syncDefaults(); }
