#include "quorl-syncd/transfer/Sync.h"

#include <algorithm>
#include <span>
#include <system_error>
#include <utility>

#include "quorl-syncd/transfer/ContentHash.h"
#include "quorl-syncd/transfer/Sentences.h"
#include "quorl-syncd/transfer/Stopped.h"

namespace quorl::syncd {

namespace {

using wearable::Entry;

Files filesOf(const wearable::Manifest& manifest, Device& device) {
    Files files;
    const auto look = [&](const Entry& entry) {
        if (const auto file = device.find(entry.name)) {
            files.emplace(entry.name, *file);
        }
    };
    std::ranges::for_each(manifest.strays, look);
    std::ranges::for_each(manifest.songs, look);
    if (manifest.playlist) {
        look(*manifest.playlist);
    }
    return files;
}

/// Writes a small file of the music directory, and waits until it is on the device.
void write(Device& device, const std::string& name, std::string_view text,
           Device::IfThere ifThere) {
    constexpr auto unfinished = "small";
    const auto file = device.createUnfinished(unfinished);
    file->write(std::as_bytes(std::span(text)));
    file->sync();
    device.finish(unfinished, name, ifThere);
    device.syncMusic();
}

void remove(const std::vector<Entry>& entries, Device& device) {
    for (const auto& entry : entries) {
        device.removeMusic(entry.name);
    }
}

} // namespace

Sync::Sync(Order order, const SyncPorts& ports, std::stop_token stop, Told told)
    : order_(std::move(order)), ports_(ports), stop_(std::move(stop)), told_(std::move(told)) {}

Outcome Sync::run() {
    using Kind = Outcome::Kind;
    try {
        const auto device = ports_.openDevice(order_.wearable);
        try {
            perform(*device);
            return outcome();
        } catch (...) {
            cleanUp(*device);
            throw;
        }
    } catch (const Stopped&) {
        return {Kind::Stopped, "The sync was stopped.", false, false};
    } catch (const std::system_error& error) {
        return {Kind::Failed, sentence(troubleOf(error.code()), error.code()), false, true};
    } catch (const std::exception& error) {
        return {Kind::Failed, error.what(), false, true};
    }
}

void Sync::perform(Device& device) {
    takeStock(device);
    removeUseless(device);
    requireSpace(device);
    announce();

    told_(plan_.progress);
    copySongs(device);

    writePlaylist(device);
    keepOnlyWhatIsWished(device);
}

/// What has been copied counts next time, if the device still can be written to.
void Sync::cleanUp(Device& device) {
    try {
        device.removeUnfinished();
        if (ledger_) {
            ledger_->save();
        }
    } catch (const std::system_error&) {
        // The failure that is under way says more.
    }
}

void Sync::takeStock(Device& device) {
    ledger_.emplace(device);
    device.removeUnfinished();
    const auto& known = ledger_->manifest();
    const auto ask = hashes(device);
    ledger_->replaceByWhatIsThere(whatIsThere(known, filesOf(known, device), ask));
    plan_ = planOf(order_, ledger_->manifest(), device.musicNames(), ask);
    for (const auto& song : plan_.adopted) {
        ledger_->adopt(song);
    }
}

Hashes Sync::hashes(Device& device) const {
    return {[this](const Entry& song) {
                const auto file = ports_.songs.open(order_.library->root, song.source,
                                                    {song.size, song.modified});
                return hashOf(*file, stop_);
            },
            [this, &device](const std::string& name) {
                const auto file = device.openMusic(name);
                return hashOf(*file, stop_);
            }};
}

/// Before the space is looked at.
void Sync::removeUseless(Device& device) {
    remove(plan_.useless, device);
    ledger_->straysAreGone();
}

void Sync::requireSpace(Device& device) {
    const auto available = device.available();
    if (plan_.progress.totalBytes > available) {
        throw std::runtime_error(notEnoughSpace(plan_.progress.totalBytes, available));
    }
}

void Sync::announce() {
    for (const auto& song : plan_.songs) {
        if (song.hash.empty()) {
            ledger_->announce(song);
        }
    }
    if (plan_.isPlaylistNew) {
        ledger_->announce(plan_.playlist);
    }
    ledger_->beginChanges();
}

void Sync::copySongs(Device& device) {
    Copier copier({ports_, device, *ledger_, order_.library->root, stop_, told_}, plan_.progress);
    const auto problems = copier.copy(plan_.songs);
    plan_.problems.insert(plan_.problems.end(), problems.begin(), problems.end());
}

void Sync::writePlaylist(Device& device) {
    const auto text = playlistText(order_, plan_.songs);
    auto playlist = plan_.playlist;
    playlist.size = text.size();
    playlist.hash = hashOf(text);
    const bool isChanged = playlist != plan_.playlist;
    if (plan_.isPlaylistNew) {
        if (isChanged) {
            ledger_->announce(playlist);
            ledger_->save();
        }
        write(device, playlist.name, text, Device::IfThere::Fail);
    } else if (isChanged) {
        write(device, playlist.name, text, Device::IfThere::Replace);
    }
    ledger_->playlistIsThere(playlist);
}

/// Makes the new list valid; then, not before, removes what is no longer wished for. An old copy of
/// a song that cannot be sent now is better than none.
void Sync::keepOnlyWhatIsWished(Device& device) {
    if (plan_.problems.empty()) {
        ledger_->keepOnly(plan_.songs);
        if (!ledger_->manifest().strays.empty()) {
            ledger_->save();
            remove(ledger_->manifest().strays, device);
            ledger_->straysAreGone();
            device.syncMusic();
        }
        ledger_->wasSent(order_.selection);
    }
    ledger_->save();
}

Outcome Sync::outcome() const {
    if (plan_.problems.empty()) {
        return {Outcome::Kind::Sent, synced(plan_.songs.size()), false, false};
    }
    return {Outcome::Kind::Failed, notAllSent(plan_.problems), true, false};
}

} // namespace quorl::syncd
