#include "quorl-syncd/transfer/Ledger.h"

#include <algorithm>
#include <iterator>
#include <string_view>
#include <utility>

namespace quorl::syncd {

namespace {

using wearable::Entry;

/// Names of entries that stay as they are meanwhile.
class Names {
  public:
    explicit Names(std::span<const Entry> entries) {
        names_.reserve(entries.size());
        std::ranges::transform(entries, std::back_inserter(names_), &Entry::name);
        std::ranges::sort(names_);
    }

    [[nodiscard]] bool contains(std::string_view name) const {
        return std::ranges::binary_search(names_, name);
    }

  private:
    std::vector<std::string_view> names_;
};

/// Whether there were any.
bool eraseNamesOf(std::span<const Entry> named, std::vector<Entry>& entries) {
    if (named.empty() || entries.empty()) {
        return false;
    }
    const Names names(named);
    return std::erase_if(entries, [&](const Entry& entry) { return names.contains(entry.name); }) >
           0;
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
        if (stray.hash.empty()) {
            names.push_back(stray.name);
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

void Ledger::revoke(const std::string& name) {
    const auto erased =
        std::erase_if(manifest_.strays, [&](const Entry& entry) { return entry.name == name; });
    isSaved_ = isSaved_ && erased == 0;
}

void Ledger::songsAreThere(std::span<const Entry> songs) {
    if (manifest_.strays.empty()) {
        return;
    }
    const Names strays(manifest_.strays);
    std::vector<Entry> there;
    std::ranges::copy_if(songs, std::back_inserter(there), [&](const Entry& song) {
        return !song.hash.empty() && strays.contains(song.name);
    });
    eraseNamesOf(there, manifest_.strays);
    isSaved_ = isSaved_ && there.empty();
    append(std::move(there), manifest_.songs);
}

void Ledger::playlistIsGone() { set(manifest_.playlist, {}); }

void Ledger::playlistIsThere(const Entry& playlist) {
    revoke(playlist.name);
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
