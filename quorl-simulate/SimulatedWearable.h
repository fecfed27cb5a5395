#pragma once

#include <map>
#include <optional>
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
    /// What they have removed or renamed, which a loss of power can bring back.
    std::set<std::string> formerFilesOfOthers = {};
    /// Names of files that were ours until somebody damaged the list of them.
    std::set<std::string> orphans = {};

    /// Somebody has removed or changed what is ours, and the engine has not looked since.
    bool isExcused = false;
    /// Then the preferences are, too, until a look after the sync that has noticed.
    bool isClaimExcused = false;
    bool isLookedAt = false;
    /// Ever.
    bool isDamaged = false;
    std::optional<wearable::Manifest> excusedManifest = {};
    std::optional<wearable::Entry> excusedPlaylist = {};

    [[nodiscard]] SimulatedDisk::Node music() const;

    /// As the engine reads it. Throws `wearable::BadManifest`.
    [[nodiscard]] wearable::Manifest manifest() const;
    [[nodiscard]] bool isManifestDurable() const;
    /// Nothing where it cannot be read.
    [[nodiscard]] std::optional<wearable::Manifest> readableManifest() const;

    [[nodiscard]] wearable::Usage usage() const;

    /// A hand has been on what is ours.
    void excuse();
    void engineLooks();
    void rememberExcused();

    void removeFileOfOthers(const std::string& name);

    /// What the others have is what there is now.
    void takeFilesOfOthers();

    /// In several lines.
    [[nodiscard]] std::string text() const;
};

} // namespace quorl::simulation
