#include "tests/engine/calls/VolumeRules.h"

#include <algorithm>
#include <array>
#include <sstream>
#include <string_view>
#include <utility>

#include "quorl-syncd/transfer/device/Device.h"
#include "services/wearable/Generations.h"

namespace quorl::syncd::testing {

namespace {

constexpr std::string_view music = "Music/";
constexpr std::string_view own = ".quorl/";

bool isOneOf(const std::string& text, std::initializer_list<std::string_view> texts) {
    return std::ranges::find(texts, text) != texts.end();
}

bool isGeneration(const std::string& file) {
    return std::ranges::any_of(wearable::generationFiles,
                               [&](const auto* name) { return file == std::string(own) + name; });
}

/// Nothing as long as it is not written to its end.
std::optional<wearable::Manifest> manifestIn(const std::string& generation) {
    const auto stored = wearable::newestManifest([&](std::string_view name) {
        return name == wearable::generationFiles[0] ? std::optional(generation) : std::nullopt;
    });
    return stored.number > 0 ? std::optional(stored.manifest) : std::nullopt;
}

std::set<std::string> songsIn(const std::string& playlist) {
    std::set<std::string> songs;
    std::istringstream lines(playlist);
    for (std::string line; std::getline(lines, line);) {
        if (!line.starts_with('#')) {
            songs.insert(line.starts_with("./") ? line.substr(2) : line);
        }
    }
    return songs;
}

std::set<std::string> namesOf(const std::vector<wearable::Entry>& entries) {
    std::set<std::string> names;
    for (const auto& entry : entries) {
        names.emplace(entry.name());
    }
    return names;
}

} // namespace

std::string VolumeRules::judge(const Step& step) {
    const auto& [operation, file, detail] = step;
    if (isOneOf(operation, {"list", "find", "open", "available", "time", "flush"})) {
        return {};
    }
    if (operation == "sync") {
        everythingIsSynced();
        return {};
    }
    if (isOneOf(file, {"/", music, own}) && isOneOf(operation, {"make", "remove", "fsync"})) {
        return judgeDirectory(step);
    }
    if (file.starts_with(music)) {
        return judgeInMusic(step, file.substr(music.size()));
    }
    return file.starts_with(own) ? judgeInOwn(step) : "a place that is not ours";
}

std::string VolumeRules::judgeDirectory(const Step& step) {
    const auto& file = step.file;
    if (step.operation == "make") {
        areDirectoriesDurable_ = !directories_.insert(file).second && areDirectoriesDurable_;
    } else if (step.operation == "remove") {
        directories_.erase(file);
    } else if (file == "/") {
        areDirectoriesDurable_ = true;
    } else if (file == own) {
        generationIsDurable();
    } else {
        namesAreDurable();
    }
    return {};
}

std::string VolumeRules::judgeInMusic(const Step& step, const std::string& name) {
    const auto& operation = step.operation;
    if (operation == "fsync") {
        unsynced_.erase(name);
        return {};
    }
    if (operation == "rename") {
        return rename(step, name);
    }
    if (operation == "remove") {
        return remove(name);
    }
    if (!isOneOf(operation, {"create", "write"})) {
        return "an operation that is none of ours";
    }
    unsynced_.insert(name);
    texts_[name] += step.detail;
    return Device::isUnfinished(name) ? "" : "a file is written under a name that counts";
}

std::string VolumeRules::rename(const Step& step, const std::string& name) {
    auto text = texts_.extract(name);
    if (!text.empty() && text.mapped().starts_with("#EXTM3U")) {
        playlists_[step.detail] = songsIn(text.mapped());
    }
    changed_.insert(step.detail);
    if (unsynced_.contains(name)) {
        return "a file gets its name before its contents are durable";
    }
    if (durable_.sent) {
        return "a name is given while the list says that all was sent";
    }
    return isAnnounced(step.detail) ? "" : "a name is given that the durable list does not tell of";
}

std::string VolumeRules::remove(const std::string& name) {
    unsynced_.erase(name);
    texts_.erase(name);
    playlists_.erase(name);
    if (Device::isUnfinished(name)) {
        return {};
    }
    changed_.insert(name);
    if (durable_.sent) {
        return "something is removed while the list says that all was sent";
    }
    if (isInPlaylist(name)) {
        return "a song is removed that a playlist names";
    }
    const bool isPlaylist = durable_.playlist && durable_.playlist->name() == name;
    return isPlaylist || isAnnounced(name)
               ? ""
               : "something is removed that the durable list does not give up";
}

bool VolumeRules::isInPlaylist(const std::string& name) const {
    const auto names = [&](const auto& playlist) { return playlist.second.contains(name); };
    return std::ranges::any_of(playlists_, names) || std::ranges::any_of(durablePlaylists_, names);
}

bool VolumeRules::isAnnounced(const std::string& name) const {
    return namesOf(durable_.strays).contains(name) && !namesOf(durable_.songs).contains(name);
}

std::string VolumeRules::judgeInOwn(const Step& step) {
    const auto& [operation, file, detail] = step;
    const bool isCurrent = generation_ && generation_->file == file;
    if (isOneOf(operation, {"create", "overwrite"}) && isGeneration(file)) {
        return beginGeneration(file);
    }
    if (operation == "write" && isCurrent) {
        if (!durableLists_.contains(file)) {
            return "a list is written before its name is durable";
        }
        generation_->isSynced = false;
        generation_->text += detail;
        const auto manifest = manifestIn(generation_->text);
        return manifest ? judgeContents(*manifest) : "";
    }
    if (operation == "fsync" && isCurrent) {
        generation_->isSynced = true;
        const bool isWhole = generation_->text.empty() || manifestIn(generation_->text);
        return isWhole ? "" : "a list is not whole";
    }
    if (operation == "remove" && isGeneration(file)) {
        return removeGeneration(file);
    }
    const bool isFormer = file == std::string(own) + wearable::formerManifestFile;
    return operation == "remove" && isFormer ? "" : "an operation that is none of ours";
}

std::string VolumeRules::beginGeneration(const std::string& file) {
    const bool isOtherDurable = !generation_ || generation_->file == file;
    generation_ = {file, "", false};
    if (!isOtherDurable) {
        return "a list is written before the other one is durable";
    }
    if (!areDirectoriesDurable_) {
        return "a list is written before its directory is durable";
    }
    return file == newestFile_ ? "the newest list is written over" : "";
}

std::string VolumeRules::removeGeneration(const std::string& file) {
    durableLists_.erase(file);
    if (generation_ && generation_->file == file) {
        generation_.reset();
    }
    return file == newestFile_ ? "the newest list is removed" : "";
}

bool VolumeRules::mayBeLost(const std::string& name) const {
    return changed_.contains(name) || changedBeforeSync_.contains(name);
}

/// As soon as they may be on the device, which need not wait for us.
std::string VolumeRules::judgeContents(const wearable::Manifest& manifest) const {
    if (manifest.sent && !(unsynced_.empty() && changed_.empty() && changedBeforeSync_.empty())) {
        return "all is said to be sent before it is durable";
    }
    return std::ranges::any_of(namesOf(manifest.songs),
                               [this](const auto& name) { return mayBeLost(name); })
               ? "a song is said to be there before it is durable"
               : "";
}

void VolumeRules::generationIsDurable() {
    if (generation_) {
        durableLists_.insert(generation_->file);
    }
    if (generation_ && generation_->isSynced && !generation_->text.empty()) {
        durable_ = manifestIn(generation_->text).value_or(wearable::Manifest());
        newestFile_ = generation_->file;
        generation_.reset();
    }
}

/// The names themselves are the matter of their directory.
void VolumeRules::everythingIsSynced() {
    unsynced_.clear();
    changedBeforeSync_.merge(changed_);
    changed_.clear();
}

void VolumeRules::namesAreDurable() {
    if (changed_.empty()) {
        durablePlaylists_ = playlists_;
    }
    changedBeforeSync_.clear();
}

std::string firstBreach(const Steps& steps) {
    VolumeRules rules;
    for (const auto& step : steps) {
        const auto breach = rules.judge(step);
        if (!breach.empty()) {
            return breach + ": " + step.operation + " " + step.file + " " + step.detail;
        }
    }
    return {};
}

} // namespace quorl::syncd::testing
