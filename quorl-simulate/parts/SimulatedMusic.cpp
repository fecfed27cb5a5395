#include "quorl-simulate/parts/SimulatedMusic.h"

#include <algorithm>
#include <cstring>

namespace quorl::simulation {

namespace {

using syncd::SongProblem;
using syncd::SongTrouble;

/// An open file, which is another one than what replaces it.
class SimulatedSong final : public syncd::OpenSong {
  public:
    SimulatedSong(std::string path, std::shared_ptr<const SimulatedMusic::Song> song,
                  const base::FileState& expected)
        : path_(std::move(path)), song_(std::move(song)), expected_(expected) {
        SimulatedSong::requireUnchanged();
    }

    [[nodiscard]] std::size_t read(std::span<std::byte> buffer) override {
        if (!song_->isReadable) {
            throw SongProblem(SongTrouble::Unreadable, path_, std::strerror(EIO));
        }
        const auto begin = std::min(read_, song_->bytes.size());
        const auto piece = std::string_view(song_->bytes).substr(begin, buffer.size());
        std::ranges::copy(std::as_bytes(std::span(piece)), buffer.begin());
        read_ += piece.size();
        return piece.size();
    }

    void requireUnchanged() const override {
        if (base::FileState{song_->bytes.size(), song_->modified} != expected_) {
            throw SongProblem(SongTrouble::Changed, path_);
        }
    }

  private:
    const std::string path_;
    const std::shared_ptr<const SimulatedMusic::Song> song_;
    const base::FileState expected_;
    std::size_t read_ = 0;
};

struct SimulatedFolder final : syncd::WatchedMusic {
    explicit SimulatedFolder(SimulatedMusic& music) : music_(music) {}

    void rescan() override { music_.didChange(); }

    SimulatedMusic& music_;
};

std::uint64_t revisionOf(const SimulatedMusic::Selected& songs) {
    std::uint64_t revision = 14'695'981'039'346'656'037U;
    const auto add = [&](std::uint64_t value) {
        revision = (revision ^ value) * 1'099'511'628'211;
    };
    for (const auto& [path, size, modified] : songs) {
        std::ranges::for_each(path, [&](unsigned char byte) { add(byte); });
        add(size + 1'000);
        add(static_cast<std::uint64_t>(modified));
    }
    return revision;
}

} // namespace

void SimulatedMusic::note(const std::string& path) {
    const auto& song = *songs.at(path);
    versions_[path].push_back({song.modified, song.bytes});
}

std::shared_ptr<const media::Inventory> SimulatedMusic::inventory() {
    if (!inventory_) {
        inventory_ = takeInventory();
    }
    return inventory_;
}

std::shared_ptr<const media::Inventory> SimulatedMusic::takeInventory() {
    auto inventory = std::make_shared<media::Inventory>();
    inventory->root = "/music";
    inventory->rootFound = true;
    std::map<std::string, media::SongIndex> indices;
    for (const auto& [id, list] : lists) {
        media::Playlist playlist{id, 0, list.title, list.title + ".m3u8", false, {}, {}};
        Selected selected;
        for (const auto& path : list.songs) {
            const auto song = songs.find(path);
            if (song == songs.end()) {
                continue;
            }
            const auto slash = path.find('/');
            const auto [size, modified] =
                std::pair(song->second->bytes.size(), song->second->modified);
            if (!indices.contains(path)) {
                const auto directory = inventory->songs.addDirectory(path.substr(0, slash));
                indices[path] = inventory->songs.add(
                    directory, {"", std::string_view(path).substr(slash + 1), size, modified, {}});
            }
            playlist.songs.push_back(indices[path]);
            selected.emplace_back(path, size, modified);
        }
        playlist.revision = revisionOf(selected);
        held_[{id, playlist.revision}] = selected;
        inventory->playlists.push_back(std::move(playlist));
    }
    return inventory;
}

const SimulatedMusic::Selected* SimulatedMusic::held(std::uint64_t list,
                                                     std::uint64_t revision) const {
    const auto found = held_.find({list, revision});
    return found == held_.end() ? nullptr : &found->second;
}

bool SimulatedMusic::everWas(const std::string& path, std::int64_t modified,
                             const std::string& bytes) const {
    const auto found = versions_.find(path);
    return found != versions_.end() &&
           std::ranges::any_of(found->second, [&](const Version& version) {
               return version.modified == modified && version.bytes == bytes;
           });
}

void SimulatedMusic::didChange() {
    inventory_.reset();
    turns_.callAt(turns_.now() + std::chrono::milliseconds(10), [this] { tell(); });
}

void SimulatedMusic::tell() {
    const auto now = inventory();
    if (changed_ && (!told_ || (told_ != now && *told_ != *now))) {
        told_ = now;
        changed_(now);
    }
}

std::unique_ptr<syncd::WatchedMusic> SimulatedMusic::watch(const std::string& /*folder*/,
                                                           Changed changed) {
    changed_ = std::move(changed);
    told_.reset();
    didChange();
    return std::make_unique<SimulatedFolder>(*this);
}

std::unique_ptr<syncd::OpenSong> SimulatedMusic::open(const std::filesystem::path& /*root*/,
                                                      const std::string& path,
                                                      const base::FileState& expected) {
    const auto found = songs.find(path);
    if (found == songs.end()) {
        throw SongProblem(SongTrouble::Gone, path);
    }
    return std::make_unique<SimulatedSong>(path, found->second, expected);
}

} // namespace quorl::simulation
