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

} // namespace

SimulatedDisk::Node SimulatedWearable::music() const {
    return directoryOf(disk, Directory::Music).value();
}

std::string SimulatedWearable::rawManifest() const {
    std::string raw;
    for (const auto* name : wearable::generationFiles) {
        raw += readOwn(disk, name).value_or("-");
    }
    return raw;
}

wearable::Manifest SimulatedWearable::manifest() const {
    return wearable::newestManifest([this](const char* name) { return readOwn(disk, name); })
        .manifest;
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
    isLookedAt = false;
    excusedManifest = rawManifest();
}

void SimulatedWearable::takeFilesOfOthers() {
    Files left;
    for (const auto& [name, file] : filesOfOthers) {
        if (const auto found = disk.find(music(), name)) {
            left[name] = {disk.read(*found), disk.status(*found).modified};
        }
    }
    filesOfOthers = left;
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
