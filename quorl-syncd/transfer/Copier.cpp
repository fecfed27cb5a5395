#include "quorl-syncd/transfer/Copier.h"

#include <algorithm>
#include <system_error>
#include <utility>

#include "quorl-syncd/transfer/Stopped.h"
#include "services/wearable/ContentHash.h"

namespace quorl::syncd {

namespace {

using wearable::Entry;

constexpr std::size_t largestPiece = 1 << 20;

} // namespace

Copier::Copier(const Means& means, CopyProgress progress)
    : means_(means),
      progress_(std::move(progress)),
      rule_(means.ports.clock.now()),
      memory_(std::make_unique_for_overwrite<std::byte[]>(largestPiece)) {}

std::vector<engine::Message> Copier::copy(std::vector<Entry>& songs) {
    std::vector<engine::Message> problems;
    try {
        problems = copyAll(songs);
    } catch (...) {
        means_.ledger.songsAreThere(songs);
        throw;
    }
    means_.ledger.songsAreThere(songs);
    std::erase_if(songs, [](const Entry& song) { return !song.hash; });
    return problems;
}

std::vector<engine::Message> Copier::copyAll(std::span<Entry> songs) {
    std::vector<engine::Message> problems;
    for (auto& song : songs) {
        if (song.hash) {
            continue;
        }
        progress_.song = song.source();
        try {
            copySong(song);
        } catch (const SongProblem& problem) {
            problems.push_back(problem.message());
        } catch (const Stopped&) {
            commit();
            throw;
        }
        if (rule_.isDue(means_.ports.clock.now())) {
            commit();
        }
    }
    progress_.song.clear();
    commit();
    return problems;
}

void Copier::copySong(Entry& song) {
    const std::string path(song.source());
    const auto source = means_.ports.songs.open(means_.root, path, {song.size, song.modified});
    auto file = means_.device.createUnfinished();
    wearable::Digest hash;
    try {
        hash = fill(file, *source, song);
    } catch (const std::system_error& error) {
        if (error.code() != std::errc::file_too_large) {
            throw; // whoever opened the device takes back what was begun
        }
        means_.device.discard(file);
        throw SongProblem(SongTrouble::TooLarge, path);
    } catch (const SongProblem&) {
        means_.device.discard(file);
        throw;
    }
    rule_.songWasCopied(song.size);
    copied_.push_back({song, hash, std::move(file)});
}

/// Gives back the hash of the contents.
wearable::Digest Copier::fill(UnfinishedFile& destination, OpenSong& source, const Entry& song) {
    auto hash = copyContents(source, destination, song.size);
    source.requireUnchanged();
    destination.complete(song.modified);
    return hash;
}

/// Gives back the hash of the contents, for which they are read in any case; a copy within the
/// kernel would read them a second time.
wearable::Digest Copier::copyContents(OpenSong& source, UnfinishedFile& destination,
                                      std::uint64_t size) {
    const bool isShared = destination.share(source.descriptor());
    const auto mostBytes = progress_.bytes + size;
    wearable::ContentHash hash;
    const std::span buffer(memory_.get(), largestPiece);
    for (std::uint64_t copied = 0;;) {
        stopIf(means_.stop);
        const auto most = std::min(means_.ports.throttle.chunk(), largestPiece);
        const auto piece = buffer.first(source.read(buffer.first(most)));
        if (piece.empty()) {
            return hash.digest();
        }
        hash.add(piece);
        if (!isShared) {
            destination.write(piece);
        }
        copied += piece.size();
        if (copied > size) {
            source.requireUnchanged();
        }
        means_.ports.throttle.pace(piece.size(), means_.stop);
        pieceWasCopied(piece.size(), mostBytes);
    }
}

void Copier::pieceWasCopied(std::uint64_t bytes, std::uint64_t mostBytes) {
    progress_.bytes = std::min(progress_.bytes + bytes, mostBytes);
    means_.told(progress_);
}

/// Brings the copies onto the device, under the names that they are to have.
void Copier::commit() {
    const auto begun = means_.ports.clock.now();
    if (!copied_.empty()) {
        means_.device.settle();
        std::ranges::for_each(copied_, [this](Copied& copied) { finish(copied); });
        means_.device.settle();
    }
    for (const auto& copied : copied_) {
        copied.song.hash = copied.hash;
    }
    progress_.songs += copied_.size();
    copied_.clear();
    rule_.groupWasCommitted(begun, means_.ports.clock.now());
    means_.told(progress_);
}

/// On FAT a name may be taken that nobody can see: a file of a long name has a short one too.
void Copier::finish(Copied& copied) {
    auto& song = copied.song;
    while (!means_.device.finish(copied.file, std::string(song.name()))) {
        means_.ledger.revoke(song.name());
        song.rename(takeName(means_.names, song));
        means_.ledger.announce({song});
        means_.ledger.save();
    }
}

} // namespace quorl::syncd
