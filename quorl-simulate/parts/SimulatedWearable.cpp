#include "quorl-simulate/parts/SimulatedWearable.h"

#include <algorithm>

#include "quorl-simulate/parts/SimulatedVolume.h"
#include "quorl-syncd/transfer/device/Device.h"
#include "services/wearable/ContentHash.h"
#include "services/wearable/Generations.h"

namespace quorl::simulation {

namespace {

using Directory = syncd::Volume::Directory;

constexpr std::array manifestFiles{wearable::generationFiles[0], wearable::generationFiles[1],
                                   wearable::formerManifestFile};

/// Null where there is no such file.
const std::string* readOwn(const SimulatedDisk& disk, std::string_view name) {
    const auto own = directoryOf(disk, Directory::Own);
    const auto file = own ? disk.find(*own, name) : std::nullopt;
    return file ? &disk.read(*file) : nullptr;
}

/// Empty where this is no generation as it was written.
wearable::Manifest manifestOf(const std::string& generation) {
    return wearable::newestManifest([&](std::string_view name) {
               return name == wearable::generationFiles[0] ? std::optional(generation)
                                                           : std::nullopt;
           })
        .manifest;
}

std::string textOf(const wearable::Entry& entry) {
    return std::string(entry.name()).append(" <- ").append(entry.source()).append("\n");
}

bool isListed(const wearable::Manifest& list, const std::string& name, std::uint64_t size) {
    const auto isIt = [&](const wearable::Entry& entry) {
        return entry.name() == name && entry.size == size;
    };
    return std::ranges::any_of(list.songs, isIt) || std::ranges::any_of(list.strays, isIt) ||
           (list.playlist && isIt(*list.playlist));
}

} // namespace

/// A save begins with emptying the file that does not count.
bool ManifestMemory::isAsBefore(const SimulatedDisk& disk, std::size_t index) const {
    const auto* const file = readOwn(disk, manifestFiles.at(index));
    const auto& before = (*files_)[index];
    return (file == nullptr ? !before : before == *file) ||
           (index == next_ && file != nullptr && file->empty());
}

const wearable::Manifest& ManifestMemory::read(const SimulatedDisk& disk) {
    if (files_ && isAsBefore(disk, 0) && isAsBefore(disk, 1) && isAsBefore(disk, 2)) {
        return manifest_;
    }
    const auto read = [&disk](const char* name) {
        const auto* const file = readOwn(disk, name);
        return file == nullptr ? std::nullopt : std::optional(*file);
    };
    files_.reset();
    auto stored = wearable::newestManifest(read);
    manifest_ = std::move(stored.manifest);
    next_ = stored.number == 0 ? std::nullopt : std::optional(stored.next);
    files_ = {read(manifestFiles[0]), read(manifestFiles[1]), read(manifestFiles[2])};
    return manifest_;
}

SimulatedDisk::Node SimulatedWearable::music() const {
    return directoryOf(disk, Directory::Music).value();
}

bool SimulatedWearable::isManifestDurable() const {
    const auto own = directoryOf(disk, Directory::Own);
    return own && std::ranges::all_of(wearable::generationFiles, [&](const char* name) {
               return !disk.find(*own, name) || disk.isDurable(*own, name);
           });
}

const wearable::Manifest* SimulatedWearable::readableManifest() const {
    try {
        return &manifest();
    } catch (const wearable::BadManifest&) {
        return nullptr;
    }
}

bool SimulatedWearable::isManifestAsExcused() const {
    const auto* const list = readableManifest();
    return std::ranges::any_of(excusedManifests, [list](const auto& excused) {
        return list == nullptr ? !excused : excused == *list;
    });
}

wearable::Usage SimulatedWearable::usage() const {
    const auto& list = manifest();
    wearable::Usage usage{0, disk.available(), 0, 0, list.sent};
    const auto count = [&](const wearable::Entry& entry) {
        const auto file = disk.find(music(), entry.name());
        const auto size = file ? disk.status(*file).size : 0;
        if (!file || size != entry.size) {
            usage.sent.reset();
        }
        return size;
    };
    for (const auto& song : list.songs) {
        usage.songs += count(song);
    }
    if (list.playlist) {
        static_cast<void>(count(*list.playlist));
        const auto file = disk.find(music(), list.playlist->name());
        if (!file || wearable::hashOf(disk.read(*file)) != list.playlist->hash) {
            usage.sent.reset();
        }
    }
    return usage;
}

void SimulatedWearable::excuse() {
    isExcused = true;
    isClaimExcused = true;
    isLookedAt = false;
    excusedManifests.clear();
    rememberExcused();
}

void SimulatedWearable::engineLooks() {
    isLookedAt = true;
    takePossibleTwins();
    if (std::exchange(isListLost, false)) {
        takeOrphans();
    }
    if (isExcused) {
        rememberExcused();
    } else {
        excusedManifests.clear();
    }
}

void SimulatedWearable::considerExcuse() {
    if (isLookedAt && !excusedManifests.empty()) {
        isExcused = isManifestAsExcused() || !isManifestDurable();
    }
}

void SimulatedWearable::endExcuse() {
    isExcused = false;
    excusedManifests.clear();
    checkedRevision.reset();
}

void SimulatedWearable::loseList() {
    isDamaged = isListLost = true;
    takeOrphans();
    excuse();
}

/// What had been removed may be there again, and nobody knows it any more where the list was lost.
void SimulatedWearable::losePower(Random& random) {
    const auto before = disk.names(music());
    disk.losePower(random);
    takeFilesOfOthers();
    for (const auto& name : disk.names(music())) {
        const bool isBack = std::ranges::find(before, name) == before.end();
        if (isDamaged && isBack) {
            orphans.insert(name);
        }
    }
}

void SimulatedWearable::takeOrphans() {
    const auto names = disk.names(music());
    orphans.insert(names.begin(), names.end());
}

void SimulatedWearable::takePossibleTwins() {
    possibleTwins.clear();
    const auto names = disk.names(music());
    const auto statusOf = [&](const std::string& name) {
        return disk.status(*disk.find(music(), name));
    };
    for (const auto& name : names) {
        const bool isLikeAnother =
            syncd::Device::isUnfinished(name) && std::ranges::any_of(names, [&](const auto& other) {
                return other != name && statusOf(other) == statusOf(name);
            });
        if (isLikeAnother) {
            possibleTwins.insert(name);
        }
    }
}

bool SimulatedWearable::isExcusedFile(const std::string& name) const {
    return filesOfOthers.contains(name) || orphans.contains(name) || possibleTwins.contains(name);
}

void SimulatedWearable::rereadFilesOfOthers() {
    for (auto& [name, file] : filesOfOthers) {
        const auto node = *disk.findExactly(music(), name);
        file = {disk.read(node), disk.status(node).modified};
    }
}

/// As it is, it is not the engine's.
void SimulatedWearable::rememberExcused() {
    const auto* const list = readableManifest();
    excusedManifests.push_back(list == nullptr ? std::nullopt : std::optional(*list));
    excusedPlaylist = list == nullptr ? std::nullopt : list->playlist;
    excusedManifests.emplace_back(wearable::Manifest());
    const auto own = directoryOf(disk, Directory::Own);
    for (const auto* const name : wearable::generationFiles) {
        for (const auto& contents :
             own ? disk.possibleContents(*own, name) : std::set<std::string>()) {
            excusedManifests.emplace_back(manifestOf(contents));
        }
    }
}

void SimulatedWearable::removeFileOfOthers(const std::string& name) {
    formerFilesOfOthers.insert(name);
    filesOfOthers.erase(name);
}

/// What was ours before somebody changed it can be as it was. Of an empty file nobody can tell
/// whose it was.
void SimulatedWearable::takeFilesOfOthers() {
    auto names = formerFilesOfOthers;
    for (const auto& [name, file] : filesOfOthers) {
        names.insert(name);
    }
    filesOfOthers.clear();
    const auto* const readable = readableManifest();
    const auto list = readable == nullptr ? wearable::Manifest() : *readable;
    for (const auto& name : disk.names(music())) {
        const auto file = *disk.findExactly(music(), name);
        const auto status = disk.status(file);
        const bool canBeOurs =
            isListed(list, name, status.size) && !contentsOfOthers.contains(disk.read(file));
        const bool isTheirs = nodesOfOthers.contains(file) || (names.contains(name) && !canBeOurs);
        if (isTheirs && status.size > 0) {
            filesOfOthers[name] = {disk.read(file), status.modified};
        } else if (names.contains(name) && status.size == 0) {
            orphans.insert(name);
        }
    }
}

std::string SimulatedWearable::text() const {
    std::string text;
    for (const auto& name : disk.names(music())) {
        const auto node = *disk.find(music(), name);
        text += "  " + name + " (file " + std::to_string(node) + ", " +
                std::to_string(disk.status(node).size) + " bytes" +
                (disk.isDurable(music(), name) ? ", durable" : "") +
                (filesOfOthers.contains(name) ? ", of others" : "") + ")\n";
    }
    try {
        const auto& list = manifest();
        for (const auto& song : list.songs) {
            text += "  song   " + textOf(song);
        }
        for (const auto& stray : list.strays) {
            text += "  stray  " + textOf(stray);
        }
        text += list.playlist ? "  list   " + textOf(*list.playlist) : "";
        text += list.sent ? "  sent   " + std::to_string(list.sent->playlist) + " in " +
                                std::to_string(list.sent->revision) + "\n"
                          : "";
    } catch (const wearable::BadManifest& error) {
        text += std::string("  ") + error.what() + "\n";
    }
    return text;
}

} // namespace quorl::simulation
