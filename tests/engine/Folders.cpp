#include "tests/engine/Folders.h"

#include <algorithm>
#include <cerrno>
#include <fstream>
#include <sstream>
#include <system_error>

#include <fcntl.h>
#include <sys/stat.h>

#include "quorl-syncd/transfer/FileHash.h"
#include "quorl-syncd/transfer/device/PosixVolume.h"
#include "quorl-syncd/transfer/pace/RateLimit.h"
#include "quorl-syncd/transfer/pace/SteadyClock.h"
#include "quorl-syncd/transfer/songs/PosixSongSource.h"
#include "services/base/AtomicFile.h"
#include "services/base/FileStatus.h"
#include "services/media/MusicFolder.h"
#include "services/wearable/Generations.h"

namespace quorl::syncd::testing {

Contents contentsOf(const std::filesystem::path& directory) {
    Contents contents;
    if (std::filesystem::exists(directory)) {
        for (const auto& entry : std::filesystem::recursive_directory_iterator{directory}) {
            if (entry.is_regular_file()) {
                const auto name = entry.path().lexically_relative(directory);
                contents[name.native()] = textOf(entry.path());
            }
        }
    }
    return contents;
}

std::string textOf(const std::filesystem::path& file) {
    std::ostringstream text;
    text << std::ifstream{file, std::ios::binary}.rdbuf();
    return text.str();
}

void Music::write(const std::string& name, const std::string& text) {
    folder_.write(name, text);
    const auto time = std::filesystem::file_time_type::clock::now() - std::chrono::hours{1000} +
                      std::chrono::seconds{10 * ++writes_};
    std::filesystem::last_write_time(path() / name, time);
}

std::time_t Music::setTime(const std::string& name, std::time_t seconds) const {
    const auto file = path() / name;
    const timespec times[]{{seconds, 0}, {seconds, 0}};
    base::FileStatus status{};
    if (utimensat(AT_FDCWD, file.c_str(), times, 0) != 0 || stat(file.c_str(), &status) != 0) {
        throw std::system_error(errno, std::generic_category(), name);
    }
    return status.st_mtim.tv_sec;
}

void Music::remove(const std::string& name) const { std::filesystem::remove(path() / name); }

void Music::list(const std::vector<std::string>& songs, const std::string& title) {
    std::string text;
    for (const auto& song : songs) {
        text += song + "\n";
    }
    folder_.write(title + ".m3u8", text);
}

wearable::Manifest Player::manifest() const {
    return wearable::loadManifest(base::openRoot(path().c_str()).get());
}

Order wishFor(const Music& music, const Player& player, std::uint64_t limitType,
              std::uint64_t limit, const std::string& title) {
    auto library = media::scan(music.path());
    const auto playlist = std::ranges::find(library->playlists, title, &media::Playlist::name);
    if (playlist == library->playlists.end()) {
        throw std::runtime_error{"no playlist " + title};
    }
    const wearable::Selection selection{playlist->id, playlist->revision, limitType, limit};
    return {std::move(library), selection, player.wearable()};
}

std::unique_ptr<Volume> openPosixVolume(const wearable::Wearable& wearable) {
    return std::make_unique<PosixVolume>(wearable);
}

Outcome sync(const Order& order, const Sync::Told& told, std::stop_token stop,
             const OpenVolume& open) {
    RateLimit rate;
    PosixSongSource songs;
    const SteadyClock clock;
    const SyncPorts ports{open, songs, rate, clock};
    return Sync(
               order, ports, std::move(stop), told ? told : [](const CopyProgress&) {})
        .run();
}

std::string whatIsWrongWith(const std::filesystem::path& wearable) {
    const auto root = base::openRoot(wearable.c_str());
    const auto manifest = wearable::loadManifest(root.get());
    const auto music = wearable / wearable::musicDirectory;
    for (const auto& song : manifest.songs) {
        const std::string name(song.name());
        if (!std::filesystem::exists(music / name)) {
            return name + " is not there";
        }
        if (hashOf(textOf(music / name)) != song.hash) {
            return name + " is not complete";
        }
    }
    return {};
}

} // namespace quorl::syncd::testing
