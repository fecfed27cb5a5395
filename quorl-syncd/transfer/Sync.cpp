#include "quorl-syncd/transfer/Sync.h"

#include <algorithm>
#include <iterator>
#include <new>
#include <span>
#include <system_error>
#include <utility>

#include "quorl-syncd/transfer/FileHash.h"
#include "quorl-syncd/transfer/Messages.h"
#include "quorl-syncd/transfer/Stopped.h"
#include "quorl-syncd/transfer/SyncProblem.h"
#include "services/engine/Codes.h"
#include "services/engine/Message.h"

namespace quorl::syncd {

namespace {

using wearable::Entry;

namespace code = engine::code;

enum class Stage { Finished, Unfinished };

Files filesAmong(const std::vector<std::string>& names, Stage stage, Device& device) {
    Files files;
    for (const auto& name : names) {
        const bool isWanted = Device::isUnfinished(name) == (stage == Stage::Unfinished);
        const auto file = isWanted ? device.find(name) : std::nullopt;
        if (file) {
            files.emplace(name, *file);
        }
    }
    return files;
}

/// Unfinished files that may be removed.
Files leftoversAmong(const std::vector<std::string>& names, Device& device) {
    auto unfinished = filesAmong(names, Stage::Unfinished, device);
    return unfinished.empty()
               ? unfinished
               : removable(std::move(unfinished), filesAmong(names, Stage::Finished, device));
}

/// What there will be to write on once these are gone.
std::uint64_t bytesOf(const Files& leftovers, const std::vector<Entry>& useless) {
    std::uint64_t bytes = 0;
    for (const auto& [name, file] : leftovers) {
        bytes += file.size;
    }
    for (const auto& entry : useless) {
        bytes += entry.size;
    }
    return bytes;
}

} // namespace

Sync::Sync(Order order, SyncPorts ports, std::stop_token stop, Told told)
    : order_(std::move(order)),
      ports_(std::move(ports)),
      stop_(std::move(stop)),
      told_(std::move(told)) {}

Outcome Sync::run() {
    using Kind = Outcome::Kind;
    try {
        Device device(ports_.openVolume(order_.wearable));
        try {
            perform(device);
            return outcome();
        } catch (...) {
            cleanUp(device);
            throw;
        }
    } catch (const Stopped&) {
        return {Kind::Stopped, {code::stopped}, false, false};
    } catch (const std::system_error& error) {
        return {Kind::Failed, messageOf(error.code()), false, true};
    } catch (const std::bad_alloc&) {
        return {Kind::Failed, {code::notEnoughMemory}, false, true};
    } catch (const SyncProblem& problem) {
        return {Kind::Failed, problem.message(), false, true};
    } catch (const wearable::CannotBeSeen& problem) {
        return {Kind::Failed, problem.message(), false, true};
    } catch (const std::exception& error) {
        return {Kind::Failed, engine::other(error.what()), false, true};
    }
}

void Sync::perform(Device& device) {
    takeStock(device);
    requireRoom(device);
    told_(plan_.progress);
    settlePast(device);
    if (isDone()) {
        return;
    }
    beginChanges(device);
    announce();
    copySongs(device);
    bringPlaylist(device);
    keepOnlyWhatIsWished(device);
}

/// What has been copied counts next time, if the device still can be written to. What could not be
/// made durable counts for nothing, for the system takes it for durable from then on.
void Sync::cleanUp(Device& device) {
    constexpr int tries = 3;
    for (int each = 0; each < tries; ++each) {
        try {
            device.discardUnsettled();
            if (ledger_ && device.isPastDurable()) {
                ledger_->save();
            }
            return;
        } catch (const std::system_error&) {
            // The failure that is under way says more; but what cannot be made durable now is to be
            // given up as well.
        }
    }
}

void Sync::takeStock(Device& device) {
    ledger_.emplace(device);
    const auto names = device.musicNames();
    const auto ask = hashes(device);
    const auto find = [&](const std::string& name) {
        auto file = device.find(name);
        if (!file) {
            missing_.push_back(name);
        }
        return file;
    };
    ledger_->keepWhatIsThere(find, ask);
    plan_ = planOf(order_, ledger_->manifest(), names, ask);
    leftovers_ = leftoversAmong(names, device);
}

/// An earlier sync may have been killed before it was durable.
void Sync::settlePast(Device& device) {
    device.mayBeUnsettled(ledger_->announced(), missing_);
    device.settle();
    ledger_->adopt(plan_.adopted);
}

Hashes Sync::hashes(Device& device) const {
    return {[this](const Entry& song) {
                const auto file = ports_.songs.open(
                    order_.library->root, std::string(song.source()), {song.size, song.modified});
                return hashOf(*file, stop_);
            },
            [this, &device](const std::string& name) { return hashOfCopy(device, name); }};
}

/// Nothing where somebody has removed the file since it was looked at.
std::optional<wearable::Digest> Sync::hashOfCopy(Device& device, const std::string& name) const {
    try {
        return hashOf(*device.openMusic(name), stop_);
    } catch (const std::system_error& error) {
        if (error.code() != std::errc::no_such_file_or_directory) {
            throw;
        }
        return std::nullopt;
    }
}

void Sync::requireRoom(Device& device) {
    const auto available = device.available() + bytesOf(leftovers_, plan_.useless);
    room_ = roomFor(plan_, available);
    if (room_ == Room::NotEnough) {
        throw SyncProblem(notEnoughSpace(plan_.bytesToCopy, available));
    }
}

/// What the wearable has in the end; nothing is none of it.
std::optional<wearable::Selection> Sync::claim() const {
    return order_.isRemoval() ? std::nullopt : std::optional(order_.selection);
}

bool Sync::isDone() const {
    const auto& there = ledger_->manifest();
    return ledger_->isSaved() && there.strays.empty() && there.sent == claim() &&
           there.playlist == plan_.playlist && there.songs == plan_.songs &&
           plan_.problems.empty() && leftovers_.empty();
}

void Sync::beginChanges(Device& device) {
    ledger_->withdrawClaim();
    if (room_ == Room::EnoughWithoutUnwanted) {
        ledger_->putAside(std::exchange(plan_.unwanted, {}));
    }
    ledger_->save();
    for (const auto& [name, file] : leftovers_) {
        device.removeMusic(name);
    }
    if (removesSongsFirst()) {
        removePlaylist(device);
        device.settle();
        ledger_->playlistIsGone();
    }
    removeStrays(device);
}

/// Whether what is removed at the beginning may be named by the playlist. What has a hash was
/// there, complete; an earlier sync may have ended when it was about to remove it.
bool Sync::removesSongsFirst() const {
    const auto wasThere = [](const Entry& entry) { return entry.hash.has_value(); };
    return room_ == Room::EnoughWithoutUnwanted || std::ranges::any_of(plan_.useless, wasThere);
}

void Sync::announce() {
    const auto isComing = [](const Entry& song) { return !song.hash; };
    std::vector<Entry> coming;
    coming.reserve(static_cast<std::size_t>(std::ranges::count_if(plan_.songs, isComing)));
    std::ranges::copy_if(plan_.songs, std::back_inserter(coming), isComing);
    ledger_->announce(std::move(coming));
    ledger_->save();
}

void Sync::copySongs(Device& device) {
    Copier copier({ports_, device, *ledger_, order_.library->root, plan_.names, stop_, told_},
                  plan_.progress);
    const auto problems = copier.copy(plan_.songs);
    plan_.problems.insert(plan_.problems.end(), problems.begin(), problems.end());
}

void Sync::bringPlaylist(Device& device) {
    if (plan_.playlist) {
        writePlaylist(device, *plan_.playlist);
    } else {
        removePlaylist(device);
        device.settle();
        ledger_->playlistIsGone();
    }
}

/// It is never renamed over: a loss of power leaves the old one, the new one or none.
void Sync::writePlaylist(Device& device, Entry& playlist) {
    const auto text = playlistText(order_, plan_.songs);
    playlist.size = text.size();
    playlist.hash = hashOf(text);
    if (ledger_->manifest().playlist == playlist) {
        return;
    }
    auto file = device.createUnfinished();
    file.write(std::as_bytes(std::span(text)));
    device.settle();
    removePlaylist(device);
    putPlaylist(device, playlist, file);
    device.settle();
    ledger_->playlistIsThere(playlist);
}

void Sync::putPlaylist(Device& device, Entry& playlist, const UnfinishedFile& file) {
    for (;;) {
        ledger_->announce({playlist});
        ledger_->save();
        if (device.finish(file, std::string(playlist.name()))) {
            return;
        }
        ledger_->revoke(playlist.name());
        playlist.rename(takePlaylistName(plan_.names, playlist.source()));
    }
}

void Sync::removePlaylist(Device& device) {
    const auto& playlist = ledger_->manifest().playlist;
    if (!playlist) {
        return;
    }
    const std::string name(playlist->name());
    if (isOurPlaylist(*playlist, device.find(name), hashes(device))) {
        device.removeMusic(name);
    }
}

void Sync::removeStrays(Device& device) {
    const auto ask = hashes(device);
    const auto& strays = ledger_->manifest().strays;
    if (strays.empty()) {
        return;
    }
    for (const auto& stray : strays) {
        if (order_.isRemoval()) {
            stopIf(stop_);
        }
        const std::string name(stray.name());
        if (isOurs(stray, device.find(name), ask)) {
            device.removeMusic(name);
        }
    }
    device.settle();
    ledger_->straysAreGone();
}

/// Makes the new list valid; then, not before, removes what is no longer wished for. An old copy of
/// a song that cannot be sent now is better than none.
void Sync::keepOnlyWhatIsWished(Device& device) {
    if (plan_.problems.empty()) {
        ledger_->keepOnly(std::exchange(plan_.songs, {}));
        if (!ledger_->manifest().strays.empty()) {
            ledger_->save();
            removeStrays(device);
        }
        ledger_->wasSent(claim());
    }
    ledger_->save();
}

Outcome Sync::outcome() const {
    if (order_.isRemoval()) {
        return {Outcome::Kind::Sent, {code::removed}, false, false};
    }
    if (plan_.problems.empty()) {
        const auto leftOut = order_.library->leftOutOf(order_.playlist()).size();
        return {Outcome::Kind::Sent, synced(ledger_->manifest().songs.size(), leftOut), false,
                false};
    }
    // A song that can be read again, or stays as it is, tells nobody.
    return {Outcome::Kind::Failed, notAllSent(plan_.problems), true, true, plan_.problems};
}

} // namespace quorl::syncd
