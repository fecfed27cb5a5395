#pragma once

#include <map>
#include <optional>
#include <set>
#include <string>

#include "services/wearable/Manifest.h"
#include "tests/engine/transfer/Step.h"

namespace quorl::syncd::testing {

/// The order of steps in which a loss of power between any two of them breaks no promise, by the
/// rules of POSIX and of FAT together. Judges what really was done, whoever says so: a volume, or
/// the system calls of a program.
class VolumeRules {
  public:
    /// Follows a step that was taken; the first one on an empty wearable. Gives back which rule it
    /// breaks; empty where none.
    [[nodiscard]] std::string judge(const Step& step);

  private:
    using Names = std::set<std::string>;

    /// By the name of the playlist, the songs that it names.
    using Playlists = std::map<std::string, Names>;

    struct Generation {
        std::string file;
        std::string text;
        bool isSynced = false;
    };

    [[nodiscard]] std::string judgeDirectory(const Step& step);
    [[nodiscard]] std::string judgeInMusic(const Step& step, const std::string& name);
    [[nodiscard]] std::string judgeInOwn(const Step& step);
    [[nodiscard]] std::string rename(const Step& step, const std::string& name);
    [[nodiscard]] std::string remove(const std::string& name);
    [[nodiscard]] std::string beginGeneration(const std::string& file);
    [[nodiscard]] std::string removeGeneration(const std::string& file);
    [[nodiscard]] std::string judgeContents(const wearable::Manifest& manifest) const;
    void generationIsDurable();
    void everythingIsSynced();
    void namesAreDurable();
    [[nodiscard]] bool isAnnounced(const std::string& name) const;
    [[nodiscard]] bool isInPlaylist(const std::string& name) const;
    [[nodiscard]] bool mayBeLost(const std::string& name) const;

    wearable::Manifest durable_;
    std::string newestFile_;
    /// Files of lists that have names which are durable.
    Names durableLists_;
    std::optional<Generation> generation_;
    Names directories_;
    bool areDirectoriesDurable_ = true;

    /// Files in the music directory whose contents may not be durable.
    Names unsynced_;
    /// Names there that were given or removed and may not be durable; those before the last `sync`
    /// only lack the `fsync` of their directory.
    Names changed_;
    Names changedBeforeSync_;
    /// What was written to a file, by its present name.
    std::map<std::string, std::string> texts_;
    /// Those that are there after a loss of power, and those that are there now.
    Playlists durablePlaylists_;
    Playlists playlists_;
};

/// The first step from an empty wearable on that breaks a rule, and which rule; empty where none
/// does.
[[nodiscard]] std::string firstBreach(const Steps& steps);

} // namespace quorl::syncd::testing
