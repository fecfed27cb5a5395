#include "quorl-syncd/transfer/Ledger.h"

#include <algorithm>
#include <iterator>
#include <unordered_set>
#include <utility>

namespace quorl::syncd {

namespace {

using wearable::Entry;

template <class Entries>
void eraseNamesOf(const Entries& named, std::vector<Entry>& entries) {
    std::unordered_set<std::string> names;
    std::ranges::transform(named, std::inserter(names, names.end()), &Entry::name);
    std::erase_if(entries, [&](const Entry& entry) { return names.contains(entry.name); });
}

void eraseName(const std::string& name, std::vector<Entry>& entries) {
    std::erase_if(entries, [&](const Entry& entry) { return entry.name == name; });
}

} // namespace

Ledger::Ledger(Device& device)
    : device_(device), manifest_(device.loadManifest()), saved_(manifest_) {}

void Ledger::save() {
    if (manifest_ != saved_) {
        device_.saveManifest(manifest_);
        saved_ = manifest_;
    }
}

void Ledger::replaceByWhatIsThere(wearable::Manifest manifest) { manifest_ = std::move(manifest); }

void Ledger::straysAreGone() { manifest_.strays.clear(); }

void Ledger::withdrawClaim() { manifest_.sent.reset(); }

void Ledger::putAside(const std::vector<Entry>& songs) {
    eraseNamesOf(songs, manifest_.songs);
    manifest_.strays.insert(manifest_.strays.end(), songs.begin(), songs.end());
}

void Ledger::announce(std::span<const Entry> entries) {
    eraseNamesOf(entries, manifest_.strays);
    manifest_.strays.insert(manifest_.strays.end(), entries.begin(), entries.end());
}

void Ledger::revoke(const std::string& name) { eraseName(name, manifest_.strays); }

void Ledger::songsAreThere(std::span<const Entry> songs) {
    eraseNamesOf(songs, manifest_.strays);
    manifest_.songs.insert(manifest_.songs.end(), songs.begin(), songs.end());
}

void Ledger::playlistIsGone() { manifest_.playlist.reset(); }

void Ledger::playlistIsThere(const Entry& playlist) {
    revoke(playlist.name);
    manifest_.playlist = playlist;
}

void Ledger::keepOnly(const std::vector<Entry>& songs) {
    auto old = std::exchange(manifest_.songs, songs);
    eraseNamesOf(songs, old);
    eraseNamesOf(songs, manifest_.strays);
    manifest_.strays.insert(manifest_.strays.end(), old.begin(), old.end());
}

void Ledger::wasSent(const std::optional<wearable::Selection>& selection) {
    manifest_.sent = selection;
}

} // namespace quorl::syncd
