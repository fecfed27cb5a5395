#pragma once

#include <map>
#include <set>
#include <string>
#include <utility>

#include "quorl-simulate/SimulatedDisk.h"
#include "services/wearable/Usage.h"

namespace quorl::simulation {

/// A wearable, and what is known of it from outside.
struct SimulatedWearable {
    using Files = std::map<std::string, std::pair<std::string, std::int64_t>>;

    SimulatedDisk disk;
    /// Files of others in the music directory: contents and time.
    Files filesOfOthers = {};
    /// Names of files that were ours until somebody damaged the list of them.
    std::set<std::string> orphans = {};

    /// Somebody has removed or changed what is ours, and the engine has not looked since.
    bool isExcused = false;
    bool isLookedAt = false;
    std::string excusedManifest = {};

    [[nodiscard]] SimulatedDisk::Node music() const;

    /// Both copies of the manifest as they are, for comparison.
    [[nodiscard]] std::string rawManifest() const;

    /// As the engine reads it. Throws `wearable::BadManifest`.
    [[nodiscard]] wearable::Manifest manifest() const;

    [[nodiscard]] wearable::Usage usage() const;

    /// A hand has been on what is ours.
    void excuse();

    /// What the others have is what there is now.
    void takeFilesOfOthers();

    /// In several lines.
    [[nodiscard]] std::string text() const;
};

} // namespace quorl::simulation
