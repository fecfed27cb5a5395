#pragma once

#include "platform/Foundation.h"

/// What the limit of the sync preferences counts. Stored; a stored value may be neither of these.
enum LMSyncLimitType : NSUInteger {
    /// The amount is in megabytes: bytes are the amount shifted left by `LMSyncLimitMegabyteShift`.
    LMSyncLimitTypeStorage = 0,
    /// The amount is a number of songs.
    LMSyncLimitTypeSongs = 1,
};

inline constexpr unsigned LMSyncLimitMegabyteShift = 20;
