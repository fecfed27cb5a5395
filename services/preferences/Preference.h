#pragma once

#include <cstdint>
#include <optional>
#include <tuple>

namespace quorl::preferences {

/// One value of the shared store. Declared here once; everything that goes over the values (the
/// check of the installed schema, the reader of changes, the tests) goes over `allPreferences`.
///
/// T is `bool`, `std::uint64_t` or `std::optional<std::uint64_t>`; the last is `nothing` in the
/// store where it holds no value.
template <class T>
struct Preference {
    /// The name in the store, which is also what `gsettings` calls it.
    const char* key;

    /// What a reader gets as long as nobody has written the value, or after it was reset.
    T defaultValue;

    /// A short title, in English; the schema's summary.
    const char* description;
};

/// Whether music goes to the wearable at all. Written by the app.
inline constexpr Preference<bool> assetSyncEnabled{"asset-sync-enabled", false,
                                                   "Whether music is synced to the wearable"};

/// The 64-bit id of the chosen playlist; nothing as long as none was chosen. Stays as it is while
/// sync is switched off. Written by the app.
inline constexpr Preference<std::optional<std::uint64_t>> assetSyncPlaylistPersistentID{
    "asset-sync-playlist-persistent-id", std::nullopt, "The playlist that is synced"};

/// What `assetSyncLimit` counts, see LimitType. A reader may meet other numbers, written by other
/// programs or by later versions, and takes them for no limit. Written by the app, after the limit.
inline constexpr Preference<std::uint64_t> assetSyncLimitType{"asset-sync-limit-type", 0,
                                                              "What the playlist limit counts"};

/// How much of the playlist is synced at most, in the unit that the type names; nothing counts as
/// 0. Written by the app, before the type.
inline constexpr Preference<std::optional<std::uint64_t>> assetSyncLimit{
    "asset-sync-limit", 500, "How much of the playlist is synced at most"};

/// The id of the playlist that was last sent to the wearable in full; nothing before the first
/// time. Written by the sync engine only.
inline constexpr Preference<std::optional<std::uint64_t>>
    lastFullySentAssetSyncPlaylistPersistentID{"last-fully-sent-asset-sync-playlist-persistent-id",
                                               std::nullopt,
                                               "The playlist that was last sent in full"};

/// The revision that this playlist had when it was sent; nothing before the first time. Written by
/// the sync engine only.
inline constexpr Preference<std::optional<std::uint64_t>> lastFullySentAssetSyncPlaylistVersion{
    "last-fully-sent-asset-sync-playlist-version", std::nullopt,
    "The version of the playlist that was last sent in full"};

inline constexpr auto allPreferences = std::tuple{assetSyncEnabled,
                                                  assetSyncPlaylistPersistentID,
                                                  assetSyncLimitType,
                                                  assetSyncLimit,
                                                  lastFullySentAssetSyncPlaylistPersistentID,
                                                  lastFullySentAssetSyncPlaylistVersion};

/// Calls `visit` with each preference, in the order of the table.
template <class Visitor>
constexpr void forEachPreference(Visitor&& visit) {
    std::apply([&visit](const auto&... preference) { (visit(preference), ...); }, allPreferences);
}

/// The values of `assetSyncLimitType` that have a meaning. Stored, so the numbers stay as they are.
namespace LimitType {

inline constexpr std::uint64_t Megabytes = 0; ///< of 1,048,576 bytes each
inline constexpr std::uint64_t Songs = 1;
} // namespace LimitType

} // namespace quorl::preferences
