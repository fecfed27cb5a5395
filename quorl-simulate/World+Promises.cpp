#include <algorithm>
#include <limits>
#include <span>
#include <string_view>
#include <utility>

#include "quorl-simulate/World.h"
#include "quorl-simulate/parts/SimulatedVolume.h"
#include "services/engine/Message.h"

namespace quorl::simulation {

namespace {

using namespace std::chrono_literals;

constexpr auto upToDate = "Everything is up to date.";

/// The songs of a choice, as far as they are within its limit.
std::span<const SimulatedMusic::Selected::value_type>
withinLimit(const SimulatedMusic::Selected& songs, const wearable::Selection& choice) {
    constexpr std::uint64_t megabyte = 1 << 20;
    const auto most = std::numeric_limits<std::uint64_t>::max();
    const auto mostBytes = choice.limitType == 0 ? choice.limit * megabyte : most;
    const auto mostSongs = choice.limitType == 1 ? choice.limit : most;
    std::uint64_t bytes = 0;
    std::size_t count = 0;
    for (const auto& song : songs) {
        bytes += std::get<1>(song);
        if (bytes > mostBytes || count == mostSongs) {
            break;
        }
        ++count;
    }
    return std::span(songs).first(count);
}

/// The names that a playlist has.
std::vector<std::string_view> linesOf(std::string_view playlist) {
    std::vector<std::string_view> lines;
    while (!playlist.empty()) {
        const auto end = std::min(playlist.find('\n'), playlist.size());
        auto line = playlist.substr(0, end);
        playlist.remove_prefix(std::min(end + 1, playlist.size()));
        if (!line.starts_with('#')) {
            line.remove_prefix(line.starts_with("./") ? 2 : 0);
            lines.push_back(line);
        }
    }
    return lines;
}

} // namespace

/// The engine stops at its next operation.
void World::breach(const std::string& what) {
    const Quiet quiet(isQuiet_);
    if (!breach_) {
        breach_ = Breach{what, wearableBefore_, device().text()};
    }
    isDead_ = true;
}

void World::check() {
    if (breach_ || !isPlugged_) {
        return;
    }
    const Quiet quiet(isQuiet_);
    auto& wearable = device();
    const auto revision = wearable.disk.revision();
    if (std::exchange(wearable.checkedRevision, revision) != revision) {
        checkFilesOfOthers(wearable);
        checkManifest(wearable);
    }
    checkPreferences(wearable);
}

void World::checkFilesOfOthers(const SimulatedWearable& wearable) {
    const auto music = wearable.music();
    for (const auto& [name, file] : wearable.filesOfOthers) {
        const auto node = wearable.disk.findExactly(music, name);
        if (!node) {
            breach("a file of others is gone: " + name);
        } else if (wearable.disk.read(*node) != file.first ||
                   wearable.disk.status(*node).modified != file.second) {
            breach("a file of others was changed: " + name);
        }
    }
}

void World::checkManifest(SimulatedWearable& wearable) {
    wearable.considerExcuse();
    if (!wearable.isExcused) {
        try {
            const auto& manifest = wearable.manifest();
            if (manifest.sent) {
                checkSent(wearable, manifest);
            }
            checkPlaylist(wearable, manifest);
        } catch (const wearable::BadManifest& error) {
            if (!wearable.isDamaged) {
                breach(std::string("the manifest cannot be read: ") + error.what());
            }
        }
    }
}

/// Every byte of what the manifest calls sent is there, and stays there.
void World::checkSent(const SimulatedWearable& wearable, const wearable::Manifest& manifest) {
    const auto* const held = music_.held(manifest.sent->playlist, manifest.sent->revision);
    if (held == nullptr) {
        breach("something was sent that never was in the music folder");
        return;
    }
    const auto music = wearable.music();
    std::vector<std::string_view> names;
    std::set<std::string_view> sources;
    for (const auto& [path, size, modified] : withinLimit(*held, *manifest.sent)) {
        const auto entry = std::ranges::find(manifest.songs, path, &wearable::Entry::source);
        const auto file =
            entry == manifest.songs.end() ? std::nullopt : wearable.disk.find(music, entry->name());
        if (!file) {
            breach("called sent, but not there: " + path);
            return;
        }
        const auto& bytes = wearable.disk.read(*file);
        if (bytes.size() != size || !music_.everWas(path, modified, bytes)) {
            breach("called sent, but with other contents: " + path);
        } else if (!wearable.disk.isDurable(music, entry->name())) {
            breach("called sent, but not durable: " + path);
        }
        names.push_back(entry->name());
        sources.insert(path);
    }
    const auto list =
        manifest.playlist ? wearable.disk.find(music, manifest.playlist->name()) : std::nullopt;
    if (!list || !wearable.disk.isDurable(music, manifest.playlist->name()) ||
        linesOf(wearable.disk.read(*list)) != names) {
        breach("called sent, but without its playlist");
    }
    if (manifest.songs.size() != sources.size()) {
        breach("called sent, with songs that are not of it");
    }
}

/// They say nothing that the wearable does not say, unless they cannot be written, or the engine
/// has not looked at this wearable yet.
void World::checkPreferences(const SimulatedWearable& wearable) {
    const auto& claim = choices_.now.lastSent;
    const bool isExcused = wearable.isExcused || wearable.isClaimExcused || isNotLookedAt_ ||
                           choices_.writesUntilFailure == 0;
    const auto* const manifest = claim && !isExcused ? wearable.readableManifest() : nullptr;
    if (manifest == nullptr) {
        return;
    }
    const auto& sent = manifest->sent;
    if (!sent || *claim != syncd::SentPlaylist{sent->playlist, sent->revision}) {
        breach("the preferences say what the wearable does not");
    }
}

void World::checkPlaylist(const SimulatedWearable& wearable, const wearable::Manifest& manifest) {
    const auto list = manifest.playlist
                          ? wearable.disk.find(wearable.music(), manifest.playlist->name())
                          : std::nullopt;
    if (!list || manifest.playlist == wearable.excusedPlaylist ||
        wearable.filesOfOthers.contains(std::string(manifest.playlist->name())) ||
        wearable.disk.status(*list).size != manifest.playlist->size) {
        return;
    }
    for (const auto name : linesOf(wearable.disk.read(*list))) {
        if (!wearable.disk.find(wearable.music(), name)) {
            breach("the playlist names a song that is not there: " + std::string(name));
        }
    }
}

/// When it is written to the preferences, it is true.
void World::checkRemembered(const syncd::SentPlaylist& sent) {
    const Quiet quiet(isQuiet_);
    const auto& wearable = wearables_[opened_];
    if (!wearable.isExcused) {
        const auto& manifest = wearable.manifest();
        if (!manifest.sent ||
            syncd::SentPlaylist{manifest.sent->playlist, manifest.sent->revision} != sent) {
            breach("remembered as sent, but not by the wearable");
        } else {
            checkSent(wearable, manifest);
        }
    }
}

void World::checkMessage(bool success, const std::string& message) {
    if (isDead_) {
        return;
    }
    const bool isRemoval = message.find(" removed from ") != std::string::npos;
    if (success && isRemoval == choices_.now.lastSent.has_value()) {
        breach("a success that was not remembered");
    }
    if (!troubles_.explain(message)) {
        breach("told, but not true: " + message);
    }
}

/// What is in the way of a sync, from the first to the last.
std::string World::obstacle() {
    const auto& now = choices_.now;
    if (!now.isSyncEnabled) {
        return "Music sync is switched off.";
    }
    if (!now.playlist) {
        return "No playlist is chosen.";
    }
    if (!music_.lists.contains(*now.playlist)) {
        return "The chosen playlist is not in the music folder.";
    }
    const auto answer = look();
    if (const auto* const unseen = std::get_if<wearable::Unseen>(&answer)) {
        return engine::sentence(unseen->message);
    }
    if (!attachment_.connected) {
        return "The wearable is not connected.";
    }
    // What was sent needs none any more.
    return attachment_.onCharger || isSent() ? "" : "The wearable is not on its charger.";
}

/// Only when everybody has heard of everything.
void World::checkStatus() {
    if (breach_ || isDead_ || announcer_.isSessionThere() || device().isExcused ||
        turns_.isDueWithin(1s)) {
        return;
    }
    const auto expected = obstacle();
    const auto& status = engine_->status().status;
    if (!expected.empty() && status != expected) {
        breach("says “" + status + "” instead of “" + expected + "”");
    }
    const bool isToldBefore = status == engine_->status().lastMessage;
    if (expected.empty() && (status == upToDate ? !isSent() : !isToldBefore)) {
        breach("says “" + status + "”, which is not so");
    }
}

/// By the wearable and by the preferences.
bool World::isSent() {
    const Quiet quiet(isQuiet_);
    const auto& now = choices_.now;
    const auto inventory = music_.inventory();
    const auto* const list = now.playlist ? inventory->playlist(*now.playlist) : nullptr;
    const auto sent = device().usage().sent;
    return list != nullptr && now.lastSent == syncd::SentPlaylist{list->id, list->revision} &&
           sent == wearable::Selection{list->id, list->revision, now.limitType, now.limit};
}

/// Takes away whatever is in the way; then the engine is left alone. What it does not hear of, it
/// has to find out by itself.
void World::bringPeace() {
    if (trace_) {
        trace_("-- peace");
    }
    const Quiet quiet(isQuiet_);
    wearableBefore_ = device().text();
    mendDevices();
    mendMusic();
    mendChoices();
    turns_.call([this] { engine_->refreshWearable(); });
}

void World::mendDevices() {
    for (auto& wearable : wearables_) {
        wearable.disk.setReadOnly(false);
        wearable.disk.setSpaceOfOthers(0);
    }
    isReadOnly_ = isSlow_ = false;
    operationsToFail_ = syncsToFail_ = 0;
    if (!isPlugged_) {
        Random random(life_.seed);
        plug(true, false, random);
    }
    turns_.call([this] {
        const wearable::Attachment wished;
        if (attachment_ != wished || engine_->attachment() != wished) {
            note(Trouble::OtherAttachment);
            engine_->attach({true, true});
        }
    });
    removeBadManifest();
}

/// As its sentence asks for.
void World::removeBadManifest() {
    try {
        static_cast<void>(device().manifest());
    } catch (const wearable::BadManifest&) {
        auto& disk = device().disk;
        const auto own = *directoryOf(disk, syncd::Volume::Directory::Own);
        for (const auto& name : disk.names(own)) {
            disk.remove(own, name);
        }
        device().excuse();
    }
}

void World::mendMusic() {
    for (const auto& [path, song] : music_.songs) {
        isSongUnlocked_ = isSongUnlocked_ || !song->isReadable;
        song->isReadable = true;
        if (song->bytes.size() > largestFile) {
            note(Trouble::SongChanged);
            song->bytes.resize(largestFile / 2);
            song->modified += 1;
        }
        music_.note(path);
    }
    music_.lists.try_emplace(firstList, SimulatedMusic::List{"List 1", {}});
    music_.didChange();
}

void World::mendChoices() {
    auto& now = choices_.now;
    const auto before = now;
    isNotLookedAt_ = isNotLookedAt_ || choices_.writesUntilFailure == 0;
    choices_.writesUntilFailure = -1;
    now.isSyncEnabled = true;
    if (!now.playlist || !music_.lists.contains(*now.playlist)) {
        now.playlist = firstList;
    }
    note(Trouble::OtherChoice);
    if (now != before || isCancelled_ || isSongUnlocked_) {
        turns_.call([this] { engine_->choicesDidChange(); });
    }
}

bool World::isAtRest() {
    return !announcer_.isSessionThere() && !turns_.isDueWithin(1s) &&
           engine_->status().status == upToDate && engine_->status().syncState == "synced" &&
           isSent();
}

void World::checkEnd() {
    const Quiet quiet(isQuiet_);
    device().endExcuse();
    check();
    checkNothingElse(device().manifest());
}

void World::checkNothingElse(const wearable::Manifest& manifest) {
    const auto& disk = device().disk;
    const auto music = device().music();
    std::set<SimulatedDisk::Node> wanted;
    const auto want = [&](std::string_view name) { wanted.insert(*disk.find(music, name)); };
    for (const auto& song : manifest.songs) {
        want(song.name());
    }
    want(manifest.playlist->name());
    if (!manifest.strays.empty()) {
        breach(std::string("strays are left at the end: ").append(manifest.strays.front().name()));
    }
    for (const auto& name : disk.names(music)) {
        const bool isTwin =
            life_.rules == DiskRules::Fat && wanted.contains(*disk.find(music, name));
        const bool isOurs = isTwin ||
                            std::ranges::find(manifest.songs, name, &wearable::Entry::name) !=
                                manifest.songs.end() ||
                            manifest.playlist->name() == name;
        if (!isOurs && !device().isExcusedFile(name)) {
            breach("is left at the end: " + name);
        }
    }
}

} // namespace quorl::simulation
