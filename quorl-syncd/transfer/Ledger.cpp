#include "quorl-syncd/transfer/Ledger.h"

#include <algorithm>
#include <iterator>
#include <utility>

#include "quorl-syncd/transfer/EntryNames.h"

namespace quorl::syncd {

namespace {

using wearable::Entry;

/// Whether there were any.
bool eraseNamesOf(std::span<const Entry> named, std::vector<Entry>& entries) {
    if (named.empty() || entries.empty()) {
        return false;
    }
    const EntryNames names(named);
    const auto erased =
        std::erase_if(entries, [&](const Entry& entry) { return names.contains(entry.name()); });
    if (entries.empty()) {
        entries.shrink_to_fit(); // mostly for good
    }
    return erased > 0;
}

void append(std::vector<Entry> more, std::vector<Entry>& entries) {
    if (entries.empty()) {
        entries = std::move(more);
    } else {
        std::ranges::move(more, std::back_inserter(entries));
    }
}

} // namespace

Ledger::Ledger(Device& device) : device_(device), manifest_(device.loadManifest()) {}

void Ledger::save() {
    if (!isSaved_) {
        device_.saveManifest(manifest_);
        isSaved_ = true;
    }
}

template <class Value>
void Ledger::set(Value& value, Value changed) {
    isSaved_ = isSaved_ && value == changed;
    value = std::move(changed);
}

void Ledger::addStrays(std::vector<Entry> strays) {
    isSaved_ = isSaved_ && strays.empty();
    append(std::move(strays), manifest_.strays);
}

void Ledger::keepWhatIsThere(const FindFile& find, const Hashes& hashes) {
    isSaved_ = !forgetWhatIsNotThere(manifest_, find, hashes) && isSaved_;
}

std::vector<std::string> Ledger::announced() const {
    std::vector<std::string> names;
    for (const auto& stray : manifest_.strays) {
        if (!stray.hash) {
            names.emplace_back(stray.name());
        }
    }
    return names;
}

void Ledger::straysAreGone() { set(manifest_.strays, {}); }

void Ledger::withdrawClaim() { set(manifest_.sent, {}); }

void Ledger::putAside(std::vector<Entry> songs) {
    eraseNamesOf(songs, manifest_.songs);
    addStrays(std::move(songs));
}

void Ledger::announce(std::vector<Entry> entries) {
    eraseNamesOf(entries, manifest_.strays);
    addStrays(std::move(entries));
}

void Ledger::revoke(std::string_view name) {
    const auto erased =
        std::erase_if(manifest_.strays, [&](const Entry& entry) { return entry.name() == name; });
    isSaved_ = isSaved_ && erased == 0;
}

void Ledger::songsAreThere(std::span<const Entry> songs) {
    if (manifest_.strays.empty()) {
        return;
    }
    const auto before = manifest_.songs.size();
    addAnnounced(songs);
    const auto there = std::span(manifest_.songs).subspan(before);
    eraseNamesOf(there, manifest_.strays);
    isSaved_ = isSaved_ && there.empty();
}

void Ledger::addAnnounced(std::span<const Entry> songs) {
    const EntryNames strays(manifest_.strays);
    manifest_.songs.reserve(manifest_.songs.size() +
                            std::min(songs.size(), manifest_.strays.size()));
    std::ranges::copy_if(songs, std::back_inserter(manifest_.songs), [&](const Entry& song) {
        return song.hash && strays.contains(song.name());
    });
}

void Ledger::playlistIsGone() { set(manifest_.playlist, {}); }

void Ledger::playlistIsThere(const Entry& playlist) {
    revoke(playlist.name());
    set(manifest_.playlist, std::optional(playlist));
}

void Ledger::keepOnly(std::vector<Entry> songs) {
    isSaved_ = !eraseNamesOf(songs, manifest_.strays) && isSaved_;
    isSaved_ = isSaved_ && manifest_.songs == songs;
    auto old = std::exchange(manifest_.songs, std::move(songs));
    eraseNamesOf(manifest_.songs, old);
    addStrays(std::move(old));
}

void Ledger::wasSent(const std::optional<wearable::Selection>& selection) {
    set(manifest_.sent, selection);
}

} // namespace quorl::syncd
