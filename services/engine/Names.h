#pragma once

#include "services/base/Purpose.h"

/// Names that the sync engine has on the session bus; see resources/dbus.
namespace quorl::engine {

inline constexpr auto busName = "org.quorl.Velora.Sync";
inline constexpr auto trialBusName = "org.quorl.Velora.Sync.Trial";

[[nodiscard]] constexpr const char* busNameFor(base::Purpose purpose) {
    return purpose == base::Purpose::Trial ? trialBusName : busName;
}

inline constexpr auto managerPath = "/org/quorl/Velora/Sync";
inline constexpr auto enginePath = "/org/quorl/Velora/Sync/Engine";
inline constexpr auto wearablePath = "/org/quorl/Velora/Sync/Wearable";
inline constexpr auto sessionsPath = "/org/quorl/Velora/Sync/Sessions";

inline constexpr auto engineInterface = "org.quorl.Velora.Sync.Engine";
inline constexpr auto wearableInterface = "org.quorl.Velora.Sync.Wearable";
inline constexpr auto sessionInterface = "org.quorl.Velora.Sync.Session";
inline constexpr auto taskInterface = "org.quorl.Velora.Sync.Task";

inline constexpr auto notReadyError = "org.quorl.Velora.Sync.Error.NotReady";
inline constexpr auto readOnlyError = "org.freedesktop.DBus.Error.PropertyReadOnly";

inline constexpr auto syncOff = "off";
inline constexpr auto syncPending = "pending";
inline constexpr auto syncSyncing = "syncing";
inline constexpr auto syncSynced = "synced";
inline constexpr auto syncUnknown = "unknown";

inline constexpr auto deviceSyncType = "DVSessionTypeDeviceSync";
inline constexpr auto assetGroupingKey = "DVDeviceSyncSessionAssetTaskGroupingKey";
inline constexpr auto preparingGroupingKey = "org.quorl.preparing";

} // namespace quorl::engine
