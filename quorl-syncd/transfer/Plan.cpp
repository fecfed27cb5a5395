#include "quorl-syncd/transfer/Plan.h"

#include <algorithm>
#include <filesystem>
#include <limits>
#include <unordered_map>
#include <unordered_set>

#include "quorl-syncd/transfer/EntryNames.h"
#include "quorl-syncd/transfer/FileHash.h"
#include "quorl-syncd/transfer/device/DeviceNames.h"
#include "quorl-syncd/transfer/songs/SongProblem.h"
#include "services/base/Utf8.h"

namespace quorl::syncd {

namespace {

using wearable::Entry;

/// FAT keeps times to two seconds.
bool isSameTime(std::int64_t first, std::int64_t second) {
    constexpr std::uint64_t tolerance = 2'000'000'000;
    const auto [earlier, later] = std::minmax(first, second);
    return static_cast<std::uint64_t>(later) - static_cast<std::uint64_t>(earlier) <= tolerance;
}

bool hasContentsOf(const Entry& entry, const Hashes& hashes) {
    return entry.hash && hashes.ofCopy(std::string(entry.name())) == entry.hash;
}

/// A playlist has none: a file of 1970 may be anybody's.
bool hasTime(const Entry& entry) { return entry.modified != 0 || !entry.hash; }

bool isComplete(const Entry& entry, const std::optional<base::FileState>& file,
                const Hashes& hashes) {
    if (!file || file->size != entry.size) {
        return false;
    }
    return (hasTime(entry) && isSameTime(file->modified, entry.modified)) ||
           hasContentsOf(entry, hashes);
}

/// Entries by source, of which there may be an old and a new copy. They are mostly asked for in
/// their order, and then nothing has to be looked up.
class Index {
  public:
    explicit Index(const std::vector<Entry>& entries) : entries_(entries) {}

    /// One of the entries with this source, which `isWanted`; null: there is none.
    template <class IsWanted>
    const Entry* find(std::string_view source, IsWanted isWanted) {
        const auto* const next = next_ < entries_.size() ? &entries_[next_] : nullptr;
        const bool isNext = next != nullptr && next->source() == source;
        if (isNext && isWanted(*next)) {
            ++next_;
            return next;
        }
        if (bySource_.empty()) {
            build();
        }
        const auto [begin, end] = bySource_.equal_range(source);
        const auto found = std::find_if(begin, end, [&](const auto& each) {
            return each.second != next && isWanted(*each.second);
        });
        if (found == end) {
            return nullptr;
        }
        next_ = static_cast<std::size_t>(found->second - entries_.data()) + 1;
        return found->second;
    }

  private:
    void build() {
        bySource_.reserve(entries_.size());
        for (const auto& entry : entries_) {
            bySource_.emplace(entry.source(), &entry);
        }
    }

    const std::vector<Entry>& entries_;
    std::size_t next_ = 0;
    std::unordered_multimap<std::string_view, const Entry*> bySource_;
};

/// A song whose time alone has changed need not be copied again.
bool isCopyOf(const Entry& song, const Entry& copy, const Hashes& hashes) {
    return copy.size == song.size &&
           (copy.modified == song.modified || hashes.ofSong(song) == copy.hash);
}

/// A copy that an interrupted sync has left behind counts if it is like the song, byte for byte.
/// Gives back the hash of both; nothing where it is not.
std::optional<wearable::Digest> hashOfBoth(const Entry& song, const Entry& stray,
                                           const Hashes& hashes) {
    if (stray.size != song.size || stray.modified != song.modified) {
        return std::nullopt;
    }
    const auto hash = hashes.ofSong(song);
    return hashes.ofCopy(std::string(stray.name())) == hash ? std::optional(hash) : std::nullopt;
}

/// Those that are listed several times once.
std::vector<media::SongIndex> wishedFor(const Order& order) {
    std::vector<media::SongIndex> wished;
    std::vector<bool> isWished(order.library->songs.size());
    for (const auto index : songsWithinLimit(order)) {
        if (!isWished[index]) {
            wished.push_back(index);
            isWished[index] = true;
        }
    }
    return wished;
}

std::uint64_t sum(std::uint64_t first, std::uint64_t second) {
    const auto most = std::numeric_limits<std::uint64_t>::max();
    return first > most - second ? most : first + second;
}

/// Finds out which songs are there.
class Matching {
  public:
    Matching(Plan& plan, const wearable::Manifest& there, const Hashes& hashes)
        : plan_(plan), hashes_(hashes), songs_(there.songs), strays_(there.strays) {}

    void add(Entry song) {
        try {
            count(song, findCopy(song) || findStray(song));
            plan_.songs.push_back(std::move(song));
        } catch (const SongProblem& problem) {
            plan_.problems.push_back(problem.message());
            troubled_.emplace(song.source());
        }
    }

    /// An old copy of a song that cannot be read now is better than none.
    [[nodiscard]] std::vector<Entry> unwantedAmong(const std::vector<Entry>& songs) const {
        std::vector<Entry> unwanted;
        if (songs.empty() ||
            std::ranges::equal(songs, plan_.songs, {}, &Entry::name, &Entry::name)) {
            return unwanted;
        }
        const EntryNames wanted(plan_.songs);
        std::ranges::copy_if(songs, std::back_inserter(unwanted), [&](const Entry& song) {
            return !wanted.contains(song.name()) && !troubled_.contains(std::string(song.source()));
        });
        return unwanted;
    }

  private:
    void count(const Entry& song, bool isThere) {
        auto& progress = plan_.progress;
        ++progress.totalSongs;
        progress.totalBytes = sum(progress.totalBytes, song.size);
        progress.songs += isThere ? 1 : 0;
        auto& bytes = isThere ? progress.bytes : plan_.bytesToCopy;
        bytes = sum(bytes, song.size);
    }

    bool findCopy(Entry& song) {
        const auto* const copy = songs_.find(
            song.source(), [&](const Entry& each) { return isCopyOf(song, each, hashes_); });
        if (copy != nullptr) {
            const auto modified = song.modified;
            song = *copy;
            song.modified = modified;
        }
        return copy != nullptr;
    }

    bool findStray(Entry& song) {
        const auto* const stray = strays_.find(song.source(), [&](const Entry& each) {
            song.hash = hashOfBoth(song, each, hashes_);
            return song.hash.has_value();
        });
        if (stray != nullptr) {
            const auto hash = song.hash;
            song = *stray;
            song.hash = hash;
            plan_.adopted.push_back(song);
        }
        return stray != nullptr;
    }

    Plan& plan_;
    const Hashes& hashes_;
    Index songs_;
    Index strays_;
    std::unordered_set<std::string> troubled_;
};

std::vector<Entry> without(const std::vector<Entry>& adopted, const std::vector<Entry>& strays) {
    const EntryNames names(adopted);
    std::vector<Entry> others;
    std::ranges::copy_if(strays, std::back_inserter(others),
                         [&](const Entry& stray) { return !names.contains(stray.name()); });
    return others;
}

/// The names that are there once `removed` is gone, as devices may spell them.
TakenNames takenNames(const std::vector<std::string>& names, const std::vector<Entry>& removed) {
    std::unordered_set<std::string> free;
    for (const auto& entry : removed) {
        free.insert(base::composed(entry.name()));
    }
    TakenNames taken;
    for (const auto& name : names) {
        if (!free.contains(base::composed(name))) {
            taken.add(name);
        }
    }
    return taken;
}

/// Without a name where there is none of this title yet.
Entry playlistOf(const Order& order, const std::vector<Entry>& songs,
                 const std::optional<Entry>& there) {
    const auto& title = order.playlist().name;
    const auto text = playlistText(order, songs);
    const bool isNew = !there || there->source() != title;
    return {isNew ? "" : there->name(), title, text.size(), 0, hashOf(text)};
}

bool isToBeCopied(const Entry& song) { return !song.hash; }

/// The names on the device are only looked at where something is to get one.
void giveNames(Plan& plan, const Order& order, const std::optional<Entry>& playlistThere,
               const std::vector<std::string>& names) {
    const bool isAnyCopied = std::ranges::any_of(plan.songs, isToBeCopied);
    if (isAnyCopied) {
        plan.names = takenNames(names, plan.useless);
    }
    for (auto& song : plan.songs) {
        if (isToBeCopied(song)) {
            song.rename(takeName(plan.names, song));
        }
    }
    if (order.isRemoval()) {
        return;
    }
    plan.playlist = playlistOf(order, plan.songs, playlistThere);
    if (!isAnyCopied && plan.playlist != playlistThere) {
        plan.names = takenNames(names, plan.useless);
    }
    if (plan.playlist->name().empty()) {
        plan.playlist->rename(takePlaylistName(plan.names, order.playlist().name));
    }
}

/// Which name a song has on the device, asked for in the order of the playlist.
class NamesBySource {
  public:
    explicit NamesBySource(const std::vector<Entry>& songs) : songs_(songs) {}

    /// Empty where it is none of the songs.
    [[nodiscard]] std::string_view of(const std::string& source) {
        if (next_ < songs_.size() && songs_[next_].source() == source) {
            return songs_[next_++].name();
        }
        if (names_.empty()) {
            for (const auto& song : songs_) {
                names_.emplace(song.source(), song.name());
            }
        }
        const auto found = names_.find(source);
        return found == names_.end() ? std::string_view() : found->second;
    }

  private:
    const std::vector<Entry>& songs_;
    std::size_t next_ = 0;
    std::unordered_map<std::string_view, std::string_view> names_;
};

/// Of a playlist that lists each song once.
std::size_t bytesOfLines(const std::vector<Entry>& songs) {
    std::size_t bytes = 0;
    for (const auto& song : songs) {
        bytes += song.name().size() + 1;
    }
    return bytes;
}

} // namespace

bool isOurs(const Entry& entry, const std::optional<base::FileState>& file, const Hashes& hashes) {
    return (file && file->size == 0) || isComplete(entry, file, hashes);
}

bool isOurPlaylist(const Entry& playlist, const std::optional<base::FileState>& file,
                   const Hashes& hashes) {
    return file && file->size == playlist.size && hasContentsOf(playlist, hashes);
}

bool forgetWhatIsNotThere(wearable::Manifest& manifest, const FindFile& find,
                          const Hashes& hashes) {
    const auto strays = std::erase_if(manifest.strays, [&](const Entry& stray) {
        return !isOurs(stray, find(std::string(stray.name())), hashes);
    });
    const auto songs = std::erase_if(manifest.songs, [&](const Entry& song) {
        return !isComplete(song, find(std::string(song.name())), hashes);
    });
    const auto& playlist = manifest.playlist;
    const auto file = playlist ? find(std::string(playlist->name())) : std::nullopt;
    const bool isPlaylistLost = playlist && !isOurPlaylist(*playlist, file, hashes);
    if (isPlaylistLost) {
        if (file && file->size == 0) { // what a loss of power has left of its removal
            manifest.strays.push_back(*playlist);
        }
        manifest.playlist.reset();
    }
    if (songs > 0 || isPlaylistLost) {
        manifest.sent.reset();
    }
    return strays > 0 || songs > 0 || isPlaylistLost;
}

std::string takeName(TakenNames& names, const Entry& song) {
    return names.take(std::filesystem::path(song.source()).filename().native());
}

std::string takePlaylistName(TakenNames& names, std::string_view title) {
    return names.take(std::string(title).append(".m3u8"));
}

Plan planOf(const Order& order, const wearable::Manifest& there,
            const std::vector<std::string>& names, const Hashes& hashes) {
    Plan plan;
    Matching matching(plan, there, hashes);
    const auto wished = wishedFor(order);
    plan.songs.reserve(wished.size());
    for (const auto index : wished) {
        const auto song = order.library->songs[index];
        matching.add({"", song.path(), song.size, song.modified, std::nullopt});
    }
    plan.useless = without(plan.adopted, there.strays);
    plan.unwanted = matching.unwantedAmong(there.songs);
    giveNames(plan, order, there.playlist, names);
    return plan;
}

Room roomFor(const Plan& plan, std::uint64_t available) {
    // For the playlist and the list of our files, which are written before anything is removed.
    constexpr std::uint64_t beside = 16384;
    const auto needed = plan.bytesToCopy;
    const auto comfortable = sum(needed, sum(plan.playlist ? plan.playlist->size : 0, beside));
    if (comfortable <= available || (plan.unwanted.empty() && needed <= available)) {
        return Room::Enough;
    }
    for (const auto& song : plan.unwanted) {
        available = sum(available, song.size);
    }
    return needed <= available ? Room::EnoughWithoutUnwanted : Room::NotEnough;
}

Files removable(Files unfinished, const Files& finished) {
    std::erase_if(unfinished, [&](const auto& file) {
        return std::ranges::any_of(finished,
                                   [&](const auto& other) { return other.second == file.second; });
    });
    return unfinished;
}

std::string playlistText(const Order& order, const std::vector<Entry>& songs) {
    NamesBySource names(songs);
    auto title = order.playlist().name;
    std::ranges::replace_if(
        title, [](unsigned char byte) { return byte < ' '; }, ' ');
    std::string text = "#EXTM3U\n#PLAYLIST:" + title + "\n";
    text.reserve(text.size() + bytesOfLines(songs));
    for (const auto index : songsWithinLimit(order)) {
        const auto name = names.of(order.library->songs[index].path());
        if (!name.empty()) {
            // What begins with # would be a comment.
            text.append(name.starts_with('#') ? "./" : "").append(name) += '\n';
        }
    }
    return text;
}

} // namespace quorl::syncd
