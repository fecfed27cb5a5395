#pragma once

#include "platform/MediaLibrary.h"

/// What a plug-in shows of itself beside its panes, to hosts that try it out. A plug-in need not
/// show anything: a host says so where it asks in vain. Table and names are declarations of this
/// folder like all others, so a host and the plug-ins that it loads agree on them.

/// The answers of a plug-in to how far the sync is, each computed at the call from what the panes
/// show. No entry is null. Main thread, with a host installed.
struct QuorlInspection {
    /// The stage of the sync as a number, from 0 for nothing to do to 3 for syncing.
    NSInteger (*syncStage)();

    /// The fraction of the running sync that is done; 1 where nothing runs.
    float (*progress)();

    /// The songs of the running sync: those that are done, and all.
    NSUInteger (*completedAssetCount)();
    NSUInteger (*totalAssetCount)();

    /// The playlist that is being synced, or null.
    std::shared_ptr<MPMediaPlaylist> (*assetSyncPlaylist)();
};

/// The symbol under which a plug-in exports its table.
inline constexpr const char* QuorlInspectionSymbol = "QuorlInspectionTable";

/// The class of a row of playlists, a `UITableViewCell`, which a plug-in exports as it does its
/// root class.
inline constexpr const char* QuorlPlaylistCellClassName = "LMQuorlPlaylistCell";

/// Exports a table.
#define QUORL_EXPORT_INSPECTION(table)                                                             \
    extern "C" {                                                                                   \
    __attribute__((visibility("default"))) extern const QuorlInspection QuorlInspectionTable;      \
    const QuorlInspection QuorlInspectionTable = table;                                            \
    }
