#include "quorl-simulate/SimulatedWearable.h"

#include <algorithm>

#include "quorl-simulate/SimulatedVolume.h"
#include "services/wearable/Generations.h"

namespace quorl::simulation {

namespace {

using Directory = syncd::Volume::Directory;

std::optional<std::string> readOwn(const SimulatedDisk& disk, const char* name) {
    const auto own = directoryOf(disk, Directory::Own);
    const auto file = own ? disk.find(*own, name) : std::nullopt;
    return file ? std::optional(disk.read(*file)) : std::nullopt;
}

bool isListed(const wearable::Manifest& list, const std::string& name, std::uint64_t size) {
    const auto isIt = [&](const wearable::Entry& entry) {
        return entry.name == name && entry.size == size;
    };
    return std::ranges::any_of(list.songs, isIt) || std::ranges::any_of(list.strays, isIt) ||
           (list.playlist && isIt(*list.playlist));
}

} // namespace

SimulatedDisk::Node SimulatedWearable::music() const {
    return directoryOf(disk, Directory::Music).value();
}

wearable::Manifest SimulatedWearable::manifest() const {
    return wearable::newestManifest([this](const char* name) { return readOwn(disk, name); })
        .manifest;
}

bool SimulatedWearable::isManifestDurable() const {
    const auto own = directoryOf(disk, Directory::Own);
    return own && std::ranges::all_of(wearable::generationFiles, [&](const char* name) {
               return !disk.find(*own, name) || disk.isDurable(*own, name);
           });
}

std::optional<wearable::Manifest> SimulatedWearable::readableManifest() const {
    try {
        return manifest();
    } catch (const wearable::BadManifest&) {
        return std::nullopt;
    }
}

wearable::Usage SimulatedWearable::usage() const {
    const auto list = manifest();
    wearable::Usage usage{0, disk.available(), 0, list.sent};
    const auto count = [&](const wearable::Entry& entry) {
        const auto file = disk.find(music(), entry.name);
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
    }
    return usage;
}

void SimulatedWearable::excuse() {
    isExcused = true;
    isClaimExcused = true;
    isLookedAt = false;
    rememberExcused();
}

void SimulatedWearable::engineLooks() {
    isLookedAt = true;
    if (isExcused) {
        rememberExcused();
    }
}

/// As it is, it is not the engine's.
void SimulatedWearable::rememberExcused() {
    excusedManifest = readableManifest();
    excusedPlaylist = excusedManifest ? excusedManifest->playlist : std::nullopt;
}

void SimulatedWearable::removeFileOfOthers(const std::string& name) {
    formerFilesOfOthers.insert(name);
    filesOfOthers.erase(name);
}

/// What was ours before somebody changed it can be as it was.
void SimulatedWearable::takeFilesOfOthers() {
    auto names = formerFilesOfOthers;
    for (const auto& [name, file] : filesOfOthers) {
        names.insert(name);
    }
    filesOfOthers.clear();
    const auto list = readableManifest().value_or(wearable::Manifest());
    for (const auto& name : disk.names(music())) {
        const auto file = *disk.find(music(), name);
        if (names.contains(name) && !isListed(list, name, disk.status(file).size)) {
            filesOfOthers[name] = {disk.read(file), disk.status(file).modified};
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
        const auto list = manifest();
        for (const auto& song : list.songs) {
            text += "  song   " + song.name + " <- " + song.source + "\n";
        }
        for (const auto& stray : list.strays) {
            text += "  stray  " + stray.name + " <- " + stray.source + "\n";
        }
        text += list.playlist ? "  list   " + list.playlist->name + "\n" : "";
        text += list.sent ? "  sent   " + std::to_string(list.sent->playlist) + " in " +
                                std::to_string(list.sent->revision) + "\n"
                          : "";
    } catch (const wearable::BadManifest& error) {
        text += std::string("  ") + error.what() + "\n";
    }
    return text;
}

} // namespace quorl::simulation
