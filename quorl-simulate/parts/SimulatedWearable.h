#pragma once

#include <array>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "quorl-simulate/parts/SimulatedDisk.h"
#include "services/wearable/Usage.h"

namespace quorl::simulation {

/// The manifest of a disk, which is parsed again only when its files have become others.
class ManifestMemory {
  public:
    /// As the engine reads it. Throws `wearable::BadManifest`.
    [[nodiscard]] const wearable::Manifest& read(const SimulatedDisk& disk);

  private:
    using Files = std::array<std::optional<std::string>, 3>;

    [[nodiscard]] bool isAsBefore(const SimulatedDisk& disk, std::size_t index) const;

    std::optional<Files> files_;
    /// Which of the files is older than the other.
    std::optional<std::size_t> next_;
    wearable::Manifest manifest_;
};

/// A wearable, and what is known of it from outside.
struct SimulatedWearable {
    using Files = std::map<std::string, std::pair<std::string, std::int64_t>>;

    SimulatedDisk disk;
    /// Files of others in the music directory: contents and time.
    Files filesOfOthers = {};
    /// Those that they have made.
    std::set<SimulatedDisk::Node> nodesOfOthers = {};
    /// What they have made of files of ours.
    std::set<std::string> contentsOfOthers = {};
    /// What they have removed or renamed, which a loss of power can bring back.
    std::set<std::string> formerFilesOfOthers = {};
    /// Names of files that were ours until somebody damaged the list of them.
    std::set<std::string> orphans = {};

    /// Names of unfinished files that were like another one when the engine looked.
    std::set<std::string> possibleTwins = {};

    /// Somebody has removed or changed what is ours, and the engine has not looked since.
    bool isExcused = false;
    /// Then the preferences are, too, until a look after the sync that has noticed.
    bool isClaimExcused = false;
    bool isLookedAt = false;
    /// Ever.
    bool isDamaged = false;
    /// Since then, what a sync has put there that was under way is not known either.
    bool isListLost = false;
    /// As they were then, or a loss of power would have left them; that can bring them back, and so
    /// can a save that fails.
    std::vector<std::optional<wearable::Manifest>> excusedManifests = {};
    std::optional<wearable::Entry> excusedPlaylist = {};

    [[nodiscard]] SimulatedDisk::Node music() const;

    /// Of the disk when the promises were last looked at.
    std::optional<std::uint64_t> checkedRevision = {};
    mutable ManifestMemory memory = {};

    /// As the engine reads it. Throws `wearable::BadManifest`.
    [[nodiscard]] const wearable::Manifest& manifest() const { return memory.read(disk); }

    [[nodiscard]] bool isManifestDurable() const;
    /// Null where it cannot be read.
    [[nodiscard]] const wearable::Manifest* readableManifest() const;

    [[nodiscard]] wearable::Usage usage() const;

    /// A hand has been on what is ours.
    void excuse();
    /// Ends it where the engine has written the manifest.
    void considerExcuse();
    void endExcuse();
    /// A hand has damaged the manifest.
    void loseList();
    void engineLooks();

    void removeFileOfOthers(const std::string& name);

    /// Not one that the engine has to remove in the end.
    [[nodiscard]] bool isExcusedFile(const std::string& name) const;

    /// What the others have is as they have left it just now.
    void rereadFilesOfOthers();

    /// What is left of what was not durable follows from `random`.
    void losePower(Random& random);

    /// In several lines.
    [[nodiscard]] std::string text() const;

    [[nodiscard]] bool isManifestAsExcused() const;
    void rememberExcused();
    /// What the others have is what there is now.
    void takeFilesOfOthers();
    void takeOrphans();
    void takePossibleTwins();
};

} // namespace quorl::simulation
