#include "platform/SyncSessions.h"

#include "runtime/host/Host.h"

const std::string DVSessionTypeDeviceSync = "DVSessionTypeDeviceSync";
const std::string DVDeviceSyncSessionAssetTaskGroupingKey =
    "DVDeviceSyncSessionAssetTaskGroupingKey";
const NSNotificationName DVSessionsDidChangeNotification = "DVSessionsDidChangeNotification";

NSArray<DVSession> DVSession::sessionsWithSessionTypeIdentifier(const std::string& type) {
    return quorl::Host::required().sessions(type);
}
