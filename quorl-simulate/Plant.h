#pragma once

#include <memory>

#include "quorl-syncd/transfer/device/Volume.h"

namespace quorl::simulation {

/// A defect put into the world around the engine, which the simulation has to find.
enum class Plant {
    None,
    NoFileSync,         ///< contents are not made durable
    NoDirectorySync,    ///< names are not made durable
    ManifestFirst,      ///< the manifest is durable before the songs that it names
    SentBeforeManifest, ///< a sync is called sent that was not
    RemovalFirst,       ///< a song is removed while the list still names it
    NoOwnership,        ///< what has a name that is wanted is removed, whoever put it there
    NoRetry,            ///< what did not work is never tried again
};

/// `volume`, with the defect if it is one of a volume.
[[nodiscard]] std::unique_ptr<syncd::Volume> planted(Plant plant,
                                                     std::unique_ptr<syncd::Volume> volume);

} // namespace quorl::simulation
