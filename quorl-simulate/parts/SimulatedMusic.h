#pragma once

#include <map>
#include <memory>
#include <string>
#include <tuple>
#include <vector>

#include "quorl-simulate/parts/VirtualTurns.h"
#include "quorl-syncd/engine/ports/MusicPort.h"
#include "quorl-syncd/transfer/songs/SongSource.h"

namespace quorl::simulation {

/// A music folder in memory, which remembers everything that it ever held.
class SimulatedMusic final : public syncd::MusicPort, public syncd::SongSource {
  public:
    struct Song {
        std::string bytes;
        std::int64_t modified = 0;
        bool isReadable = true;
    };

    struct List {
        std::string title;
        std::vector<std::string> songs;
    };

    using Selected = std::vector<std::tuple<std::string, std::uint64_t, std::int64_t>>;

    explicit SimulatedMusic(VirtualTurns& turns) : turns_(turns) {}

    /// By path. Also those that are in no list.
    std::map<std::string, std::shared_ptr<Song>> songs;
    /// By identity.
    std::map<std::uint64_t, List> lists;

    /// What was changed in `songs` and `lists` is noticed soon.
    void didChange();
    /// Also of what was there before an unnoticed change.
    void note(const std::string& path);

    /// What a list held in a revision: path, size and time of each song. Null: never seen.
    [[nodiscard]] const Selected* held(std::uint64_t list, std::uint64_t revision) const;
    /// Whether the song ever had these bytes and this time.
    [[nodiscard]] bool everWas(const std::string& path, std::int64_t modified,
                               const std::string& bytes) const;
    /// As it is now.
    [[nodiscard]] std::shared_ptr<const media::Inventory> inventory();

    /// The engine is gone.
    void forget() { changed_ = nullptr; }

    [[nodiscard]] std::string usualFolder() override { return "/music"; }

    [[nodiscard]] std::unique_ptr<syncd::WatchedMusic> watch(const std::string& folder,
                                                             Changed changed) override;
    [[nodiscard]] std::unique_ptr<syncd::OpenSong> open(const std::filesystem::path& root,
                                                        const std::string& path,
                                                        const base::FileState& expected) override;

  private:
    struct Version {
        std::int64_t modified = 0;
        std::string bytes;
    };

    [[nodiscard]] std::shared_ptr<const media::Inventory> takeInventory();
    void tell();

    VirtualTurns& turns_;
    Changed changed_;
    /// Null after a change.
    std::shared_ptr<const media::Inventory> inventory_;
    std::shared_ptr<const media::Inventory> told_;
    std::map<std::pair<std::uint64_t, std::uint64_t>, Selected> held_;
    /// By path.
    std::map<std::string, std::vector<Version>, std::less<>> versions_;
};

} // namespace quorl::simulation
