#include "quorl-syncd/transfer/Sync.h"

#include <algorithm>
#include <cerrno>
#include <iterator>
#include <system_error>
#include <unordered_map>
#include <unordered_set>

#include "quorl-syncd/transfer/ContentHash.h"
#include "quorl-syncd/transfer/device/DeviceNames.h"
#include "quorl-syncd/transfer/RateLimit.h"
#include "services/base/AtomicFile.h"

namespace quorl::syncd {

namespace {

using wearable::Entry;

/// Copies are brought onto the device in groups, for it takes its time for each.
constexpr std::uint64_t fewestUnsettledBytes = std::uint64_t{16} << 20;
constexpr std::uint64_t mostUnsettledBytes = std::uint64_t{512} << 20;
constexpr std::size_t mostUnsettledSongs = 64;
constexpr std::chrono::seconds longestUnsettled{1};

std::string hashOfText(std::string_view text) {
    ContentHash hash;
    hash.add(std::as_bytes(std::span{text}));
    return hash.text();
}

/// By source, of which there may be an old and a new copy.
using Index = std::unordered_multimap<std::string, Entry>;

Index indexOf(const std::vector<Entry>& entries) {
    Index index;
    for (const auto& entry : entries) {
        index.emplace(entry.source, entry);
    }
    return index;
}

/// Whether `use` takes one of the entries with this source.
template <class Use>
bool anyOf(const Index& index, const std::string& source, Use use) {
    const auto [begin, end] = index.equal_range(source);
    return std::any_of(begin, end, [&](const auto& found) { return use(found.second); });
}

using Names = std::unordered_set<std::string>;

void eraseNames(std::vector<Entry>& entries, const Names& names) {
    std::erase_if(entries, [&](const Entry& entry) { return names.contains(entry.name); });
}

std::string velora() { return std::string{"The "} + wearable::wearableName; }

std::string countOfSongs(std::size_t count) {
    return count == 1 ? "1 song" : std::to_string(count) + " songs";
}

std::string megabytes(std::uint64_t bytes) {
    constexpr std::uint64_t megabyte = 1 << 20;
    return std::to_string((bytes + megabyte - 1) / megabyte) + " MB";
}

std::string sentence(const std::error_code& error) {
    switch (error.value()) {
    case ENOSPC:
    case EDQUOT:
        return velora() + " is full. Remove something from it, or choose a lower limit.";
    case EROFS:
    case EACCES:
    case EPERM:
        return velora() + " cannot be written to: " + error.message() +
               ". Check that it is not write-protected.";
    case ENOENT:
    case ENODEV:
    case ENOTDIR:
    case EIO:
    case ESTALE:
        return velora() + " went away: " + error.message() + ". Connect it again.";
    default:
        return velora() + " could not be synced: " + error.message() + ".";
    }
}

} // namespace

Sync::Sync(Order order, RateLimit& rate, std::stop_token stop, Told told)
    : order_{std::move(order)}, rate_{rate}, stop_{std::move(stop)}, told_{std::move(told)} {}

Outcome Sync::run() {
    using Kind = Outcome::Kind;
    try {
        Device device{order_.wearable};
        try {
            perform(device);
            return outcome();
        } catch (...) {
            // What has been copied counts next time, if the device still can be written to.
            copied_.clear();
            try {
                device.removeUnfinished();
                remember(device);
            } catch (const std::system_error&) {
                // The one that is under way says more.
            }
            throw;
        }
    } catch (const Stopped&) {
        return {Kind::Stopped, "The sync was stopped.", false};
    } catch (const std::system_error& error) {
        return {Kind::Failed, sentence(error.code()), false, true};
    } catch (const std::exception& error) {
        return {Kind::Failed, error.what(), false, true};
    }
}

void Sync::perform(Device& device) {
    takeStock(device);
    findWhatIsThere(device);
    removeStrays(device);
    chooseNames(device);
    requireSpace(device);
    if (manifest_ != saved_) {
        manifest_.sent.reset();
    }
    remember(device);

    told_(progress_);
    copySongs(device);

    writePlaylist(device);
    removeOldSongs(device);
}

/// Writes the manifest where it differs from the one on the device.
void Sync::remember(Device& device) {
    if (manifest_ != saved_) {
        device.save(manifest_);
        saved_ = manifest_;
    }
}

void Sync::takeStock(Device& device) {
    saved_ = device.loadManifest();
    manifest_ = saved_;
    device.removeUnfinished();
    std::erase_if(manifest_.strays, [&](const Entry& stray) { return !device.isOurs(stray); });
    if (std::erase_if(manifest_.songs, [&](const Entry& song) { return !device.has(song); }) > 0) {
        manifest_.sent.reset();
    }
    if (manifest_.playlist && !device.has(*manifest_.playlist)) {
        manifest_.sent.reset();
        // It may have been replaced by a sync that was then interrupted.
        manifest_.playlist->hash.clear();
        if (!device.hasFile(manifest_.playlist->name)) {
            manifest_.playlist.reset();
        }
    }
}

void Sync::findWhatIsThere(Device& device) {
    const auto songs = indexOf(manifest_.songs);
    const auto strays = indexOf(manifest_.strays);
    std::unordered_set<media::SongIndex> seen;
    for (const auto index : songsWithinLimit(order_)) {
        if (!seen.insert(index).second) {
            continue;
        }
        const auto listed = order_.library->songs[index];
        Song song{"", listed.path(), listed.size, listed.modified, ""};
        try {
            const bool isThere =
                anyOf(songs, song.source, [&](const Entry& each) { return adopt(song, each); }) ||
                anyOf(strays, song.source,
                      [&](const Entry& each) { return adoptStray(device, song, each); });
            if (!isThere) {
                ++progress_.totalSongs;
                progress_.totalBytes += song.size;
            }
            songs_.push_back(std::move(song));
        } catch (const SongProblem& problem) {
            leaveOut(problem);
        }
    }
}

/// A song whose time alone has changed need not be copied again.
bool Sync::adopt(Song& song, const Entry& there) {
    if (there.size != song.size) {
        return false;
    }
    if (there.modified != song.modified) {
        const SongSource file{order_.library->root, song.source, {song.size, song.modified}};
        if (file.hash(stop_) != there.hash) {
            return false;
        }
    }
    song.name = there.name;
    song.hash = there.hash;
    return true;
}

/// A copy that an interrupted sync has left behind counts if it is like the song, byte for byte.
bool Sync::adoptStray(const Device& device, Song& song, const Entry& stray) {
    if (stray.size != song.size || stray.modified != song.modified) {
        return false;
    }
    const SongSource file{order_.library->root, song.source, {song.size, song.modified}};
    const auto hash = file.hash(stop_);
    if (hashOf(device.openMusic(stray.name).get(), stop_) != hash) {
        return false;
    }
    song.name = stray.name;
    song.hash = hash;
    manifest_.songs.push_back(song);
    eraseNames(manifest_.strays, {song.name});
    return true;
}

void Sync::removeStrays(Device& device) {
    for (const auto& stray : manifest_.strays) {
        device.removeMusic(stray.name);
    }
    manifest_.strays.clear();
}

void Sync::chooseNames(const Device& device) {
    TakenNames names;
    for (const auto& name : device.musicNames()) {
        names.add(name);
    }
    for (auto& song : songs_) {
        if (song.hash.empty()) {
            song.name = names.take(std::filesystem::path{song.source}.filename().native());
            manifest_.strays.push_back(song);
        }
    }
    const auto& title = order_.playlist().name;
    if (manifest_.playlist && manifest_.playlist->source == title) {
        playlist_ = *manifest_.playlist;
    } else {
        const auto text = playlistText();
        playlist_ = {names.take(title + ".m3u8"), title, text.size(), 0, hashOfText(text)};
        manifest_.strays.push_back(playlist_);
    }
}

void Sync::requireSpace(const Device& device) {
    const auto available = device.available();
    if (progress_.totalBytes > available) {
        manifest_.strays.clear();
        throw std::runtime_error{
            velora() + " has not enough space: " + megabytes(progress_.totalBytes) +
            " are needed for new songs, " + megabytes(available) +
            " are available. Remove something from it, or choose a lower limit."};
    }
}

void Sync::copySongs(Device& device) {
    settled_ = std::chrono::steady_clock::now();
    for (auto& song : songs_) {
        if (!song.hash.empty()) {
            continue;
        }
        try {
            copySong(device, song);
        } catch (const SongProblem& problem) {
            leaveOut(problem);
        } catch (const Stopped&) {
            settle(device);
            throw;
        }
        const bool isDue = copied_.size() >= mostUnsettledSongs ||
                           unsettledBytes_ >= unsettledLimit_ ||
                           std::chrono::steady_clock::now() - settled_ >= longestUnsettled;
        if (isDue) {
            settle(device);
        }
    }
    settle(device);
    std::erase_if(songs_, [](const Song& song) { return song.hash.empty(); });
}

void Sync::copySong(Device& device, Song& song) {
    const auto unfinished = std::to_string(copied_.size());
    const SongSource source{order_.library->root, song.source, {song.size, song.modified}};
    auto destination = device.createUnfinished(unfinished);
    const auto before = progress_.bytes;
    const auto moved = [this, &song, before](std::uint64_t bytes) {
        progress_.bytes = std::min(progress_.bytes + bytes, before + song.size);
        told_(progress_);
    };
    try {
        song.hash = source.copyTo(destination.get(), rate_, moved, stop_);
    } catch (const std::system_error& error) {
        if (error.code() == std::errc::file_too_large) {
            throw SongProblem{"“" + song.name + "” is larger than a file on the " +
                              wearable::wearableName + " can be."};
        }
        throw;
    }
    unsettledBytes_ += song.size;
    copied_.push_back({&song, unfinished, std::move(destination)});
}

/// Brings the copies onto the device, under the names that they are to have.
void Sync::settle(Device& device) {
    const auto begun = std::chrono::steady_clock::now();
    for (const auto& [song, unfinished, file] : copied_) {
        base::syncToDevice(file.get());
        device.finish(unfinished, song->name);
    }
    if (!copied_.empty()) {
        device.syncMusic();
    }
    Names settledNames;
    for (const auto& copied : copied_) {
        manifest_.songs.push_back(*copied.song);
        settledNames.insert(copied.song->name);
    }
    eraseNames(manifest_.strays, settledNames);
    progress_.songs += copied_.size();
    copied_.clear();
    unsettledBytes_ = 0;
    settled_ = std::chrono::steady_clock::now();
    // As much at a time as goes quickly, for there is no progress meanwhile.
    unsettledLimit_ = std::clamp(settled_ - begun < longestUnsettled / 4 ? unsettledLimit_ * 2
                                                                         : unsettledLimit_ / 2,
                                 fewestUnsettledBytes, mostUnsettledBytes);
    told_(progress_);
}

void Sync::leaveOut(const SongProblem& problem) { problems_.emplace_back(problem.what()); }

/// With the paths as they are on the device, in the order of the playlist.
std::string Sync::playlistText() const {
    std::unordered_map<std::string_view, std::string_view> names;
    for (const auto& song : songs_) {
        names.emplace(song.source, song.name);
    }
    auto title = order_.playlist().name;
    std::ranges::replace_if(
        title, [](unsigned char byte) { return byte < ' '; }, ' ');
    std::string text = "#EXTM3U\n#PLAYLIST:" + title + "\n";
    for (const auto index : songsWithinLimit(order_)) {
        const auto name = names.find(order_.library->songs[index].path());
        if (name != names.end()) {
            // What begins with # would be a comment.
            text.append(name->second.starts_with('#') ? "./" : "").append(name->second) += '\n';
        }
    }
    return text;
}

void Sync::writePlaylist(Device& device) {
    const auto text = playlistText();
    const auto announced = playlist_;
    playlist_.size = text.size();
    playlist_.hash = hashOfText(text);
    if (manifest_.playlist && manifest_.playlist->name == playlist_.name) {
        if (manifest_.playlist != playlist_) {
            device.replaceMusic(playlist_.name, text);
        }
        return;
    }
    if (announced != playlist_) {
        eraseNames(manifest_.strays, {playlist_.name});
        manifest_.strays.push_back(playlist_);
        remember(device);
    }
    device.writeMusic(playlist_.name, text);
}

/// Makes the new list valid; then, not before, removes what is no longer wished for.
void Sync::removeOldSongs(Device& device) {
    auto old = std::exchange(manifest_.strays, {});
    if (manifest_.playlist) {
        old.push_back(*manifest_.playlist);
    }
    manifest_.playlist = playlist_;
    eraseNames(old, {playlist_.name});
    if (!problems_.empty()) {
        // An old copy of a song that cannot be sent now is better than none.
        manifest_.strays = std::move(old);
        remember(device);
        return;
    }
    old.insert(old.end(), manifest_.songs.begin(), manifest_.songs.end());
    Names wanted;
    std::ranges::transform(songs_, std::inserter(wanted, wanted.end()), &Song::name);
    eraseNames(old, wanted);
    manifest_.songs = songs_;
    if (!old.empty()) {
        manifest_.strays = std::move(old);
        manifest_.sent.reset();
        remember(device);
        removeStrays(device);
        device.syncMusic();
    }
    manifest_.sent = order_.selection;
    remember(device);
}

Outcome Sync::outcome() const {
    if (problems_.empty()) {
        return {Outcome::Kind::Sent,
                countOfSongs(songs_.size()) + " synced to " + wearable::wearableName + ".", false};
    }
    const auto others = problems_.size() - 1;
    return {Outcome::Kind::Failed,
            problems_.front() +
                (others == 0 ? "" : " " + countOfSongs(others) + " more could not be sent."),
            true};
}

} // namespace quorl::syncd
