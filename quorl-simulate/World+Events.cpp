#include <algorithm>
#include <array>
#include <cerrno>
#include <iterator>

#include "quorl-simulate/World.h"
#include "quorl-simulate/parts/SimulatedVolume.h"
#include "quorl-syncd/engine/NotReady.h"
#include "quorl-syncd/transfer/device/Device.h"
#include "services/wearable/Generations.h"

namespace quorl::simulation {

namespace {

using enum Happening;

constexpr std::int64_t second = 1'000'000'000;
constexpr std::uint64_t lists = 4;

std::string drawBytes(Random& random, std::uint64_t size) {
    std::string bytes;
    while (bytes.size() < size) {
        bytes += static_cast<char>('a' + random.below(26));
    }
    return bytes;
}

std::int64_t drawTime(Random& random) {
    return 1'600'000'000 * second + static_cast<std::int64_t>(random.below(1'000'000'000'000));
}

std::string drawPath(Random& random) {
    static constexpr std::array names{
        "One.mp3",  "one.MP3", "A long name of a song.mp3", "A long name of a tune.mp3",
        "Zwei.ogg", "aux.mp3", "Drei\xC3\xA4.mp3",          "List 1.m3u8",
        "#no.mp3",  "x.mp3",   "not \xFC UTF-8.mp3",        "not \xF6 UTF-8.mp3"};
    return (random.onceIn(2) ? "a/" : "b/") +
           std::string(names.at(random.indexBelow(names.size())));
}

template <class Container>
auto& drawFrom(Container& all, Random& random) {
    return *std::next(all.begin(), static_cast<std::ptrdiff_t>(random.below(all.size())));
}

} // namespace

void World::addSong(Random& random) {
    const auto path = drawPath(random);
    if (!music_.songs.contains(path)) {
        music_.songs[path] = std::make_shared<SimulatedMusic::Song>(
            SimulatedMusic::Song{drawBytes(random, 1 + random.below(600)), drawTime(random)});
        music_.note(path);
        note(Trouble::SongChanged); // where there was another of this name lately
    }
    const auto id = firstList + random.below(lists);
    auto& list = music_.lists[id];
    list.title = list.title.empty() ? "List " + std::to_string(id) : list.title;
    list.songs.push_back(path);
    if (!music_.lists.contains(firstList)) {
        music_.lists[firstList] = {"List 1", {path}};
    }
}

void World::happenToMusic(Happening what, Random& random) {
    constexpr std::array mine{ChangeList, ReorderList, EmptyList, RenameList, DeleteList, AddSong};
    if (std::ranges::find(mine, what) == mine.end()) {
        return;
    }
    if (what == AddSong || music_.lists.empty()) {
        addSong(random);
        music_.didChange();
        return;
    }
    auto& [id, list] = drawFrom(music_.lists, random);
    if (what == RenameList) {
        list.title = random.onceIn(2) ? "List 1" : "Other " + std::to_string(random.below(3));
    } else if (what == ReorderList) {
        std::ranges::reverse(list.songs);
    } else if (what == EmptyList) {
        list.songs.clear();
    } else if (what == DeleteList) {
        note(Trouble::ListGone);
        music_.lists.erase(id);
    } else if (list.songs.empty() || random.onceIn(2)) {
        list.songs.push_back(drawFrom(music_.songs, random).first);
    } else {
        list.songs.erase(std::next(list.songs.begin(),
                                   static_cast<std::ptrdiff_t>(random.below(list.songs.size()))));
    }
    music_.didChange();
}

void World::happenToSong(Happening what, Random& random) {
    constexpr std::array mine{ChangeSong, ReplaceSongAlike, RemoveSong,
                              LockSong,   EmptySong,        HugeSong};
    if (std::ranges::find(mine, what) == mine.end() || music_.songs.size() < 2) {
        return;
    }
    auto& [path, song] = drawFrom(music_.songs, random);
    if (what == RemoveSong) {
        note(Trouble::SongGone);
        music_.songs.erase(path);
        music_.didChange();
        return;
    }
    note(what == LockSong ? Trouble::SongUnreadable : Trouble::SongChanged);
    switch (what) {
    case ChangeSong: // its time alone, in place, or as another file
        song = random.onceIn(2) ? std::make_shared<SimulatedMusic::Song>(*song) : song;
        song->bytes = random.onceIn(3) ? song->bytes : drawBytes(random, 1 + random.below(600));
        break;
    case ReplaceSongAlike:
        song = std::make_shared<SimulatedMusic::Song>(*song);
        song->bytes = drawBytes(random, song->bytes.size());
        break;
    case LockSong:
        song->isReadable = !song->isReadable;
        isSongUnlocked_ = true;
        break;
    case EmptySong:
        song->bytes.clear();
        break;
    default:
        note(Trouble::SongTooLarge);
        song->bytes = drawBytes(random, largestFile + 1);
    }
    if (what != ReplaceSongAlike && what != LockSong) {
        song->modified = drawTime(random);
    }
    music_.note(path);
    music_.didChange();
}

void World::happenToChoices(Happening what, Random& random) {
    auto& now = choices_.now;
    switch (what) {
    case Choose:
        now.playlist =
            random.onceIn(8) ? std::nullopt : std::optional(firstList + random.below(lists));
        now.isSyncEnabled = true;
        break;
    case SetLimit:
        now.limitType = std::array<std::uint64_t, 5>{0, 1, 1, 1, 7}.at(random.indexBelow(5));
        now.limit = random.below(7);
        break;
    case ToggleSync:
        now.isSyncEnabled = !now.isSyncEnabled;
        break;
    case FailPreferences:
        note(Trouble::BadPreferences);
        isNotLookedAt_ = isNotLookedAt_ || choices_.writesUntilFailure == 0;
        choices_.writesUntilFailure = random.onceIn(3) ? -1 : static_cast<int>(random.below(3));
        return;
    case SetCalendar:
        turns_.setCalendarTime(random.seed() >> 14U);
        return;
    default:
        return;
    }
    note(Trouble::OtherChoice);
    turns_.call([this] { engine_->choicesDidChange(); });
}

void World::plug(bool isPlugged, bool isOther, Random& random) {
    device().losePower(random);
    current_ = isOther ? 1 - current_ : current_;
    isPlugged_ = isPlugged;
    ++pluggings_;
    isNotLookedAt_ = true;
    note(Trouble::Away);
    turns_.call([this] {
        ++news_;
        noticed_(syncd::WearableNews::MayBeAnother);
    });
}

void World::failOperations(std::uint64_t seed) {
    constexpr std::array errors{EIO, ENOSPC, EROFS, ESTALE};
    constexpr std::uint64_t most = 3;
    errorOfOperations_ = errors.at(seed % errors.size());
    operationsToFail_ = 1 + seed / errors.size() % most;
}

void World::happenToDevice(const Event& event, Random& random) {
    auto& disk = device().disk;
    const auto attach = [this](bool connected, bool onCharger) {
        note(Trouble::OtherAttachment);
        turns_.call([this, connected, onCharger] { engine_->attach({connected, onCharger}); });
    };
    switch (event.what) {
    case ToggleCharger:
        if (isEmbedded_) {
            attach(attachment_.connected, !attachment_.onCharger);
        }
        break;
    case TogglePlug:
        if (isEmbedded_) {
            attach(!attachment_.connected, attachment_.onCharger);
        } else {
            plug(!isPlugged_, false, random);
        }
        break;
    case SwapWearable:
        if (!isEmbedded_) {
            plug(true, true, random);
        }
        break;
    case FillDevice:
        disk.setSpaceOfOthers(std::uint64_t{1} << 32U);
        break;
    case NearlyFillDevice:
        disk.setSpaceOfOthers(0);
        disk.setSpaceOfOthers(disk.available() - std::min(disk.available(), random.below(4'000)));
        break;
    case FreeDevice:
        disk.setSpaceOfOthers(0);
        break;
    case ToggleReadOnly:
        if (isCleaningUp_) {
            break;
        }
        isReadOnly_ = !isReadOnly_;
        for (auto& wearable : wearables_) {
            wearable.disk.setReadOnly(isReadOnly_);
        }
        break;
    case ToggleSlowness:
        isSlow_ = !isSlow_;
        break;
    case FailOperations:
        failOperations(event.seed);
        break;
    case FailSync:
        syncsToFail_ = 1 + event.seed % 2;
        break;
    default:
        break;
    }
}

/// A name that a song or a playlist has or may get on the wearable. Names of unfinished files are
/// the engine's alone.
std::string World::wantedName(Random& random) const {
    return random.onceIn(4) ? "List " + std::to_string(1 + random.below(lists)) + ".m3u8"
                            : drawPath(random).substr(2);
}

void World::addFileOfOthers(Random& random) {
    auto name = random.onceIn(2) ? wantedName(random) : "Own " + std::to_string(random.below(9));
    auto& disk = device().disk;
    if (disk.find(device().music(), name) || disk.available() < 200) {
        return;
    }
    const auto file = disk.create(device().music(), name);
    disk.append(file, drawBytes(random, 1 + random.below(100)));
    disk.setModified(file, drawTime(random));
    device().nodesOfOthers.insert(file);
    device().filesOfOthers[name] = {disk.read(file), disk.status(file).modified};
}

std::string World::someOfOurs(Random& random) const {
    auto names = device().disk.names(device().music());
    std::erase_if(names,
                  [this](const auto& name) { return device().filesOfOthers.contains(name); });
    return names.empty() ? "" : names.at(random.indexBelow(names.size()));
}

void World::damageManifest(Random& random) {
    auto& disk = device().disk;
    const auto own = directoryOf(disk, syncd::Volume::Directory::Own);
    if (!own) {
        return;
    }
    const auto kind = random.below(4);
    for (std::size_t index = 0; index < 2; ++index) {
        const auto file = disk.find(*own, wearable::generationFiles.at(index));
        if (!file || (kind < 2 && kind != index)) {
            continue;
        }
        disk.truncate(*file);
        disk.append(*file,
                    drawBytes(random, std::min<std::uint64_t>(random.below(50), disk.available())));
    }
    note(Trouble::BadManifest);
    device().loseList();
}

void World::happenToFiles(Happening what, Random& random) {
    constexpr std::array mine{AddFileOfOthers, RenameFileOfOthers, RemoveFileOfOthers,
                              RemoveOurs,      ChangeOurs,         DamageManifest};
    if (std::ranges::find(mine, what) == mine.end() || isReadOnly_) {
        return;
    }
    auto& disk = device().disk;
    auto& others = device().filesOfOthers;
    const auto music = device().music();
    const auto ours = someOfOurs(random);
    if (what == AddFileOfOthers) {
        addFileOfOthers(random);
    } else if (what == DamageManifest) {
        damageManifest(random);
    } else if (what == RemoveOurs || what == ChangeOurs) {
        // A file that is being looked at cannot be told apart from what it becomes meanwhile; nor
        // can one that has lost its clusters with another name, where a loss of power brings it
        // back.
        if (ours.empty() || syncd::Device::isUnfinished(ours) ||
            (what == ChangeOurs && syncs_.isRunning()) ||
            (what == RemoveOurs && disk.isShared(music, ours))) {
            return;
        }
        device().excuse();
        device().orphans.insert(ours); // a loss of power may bring it back
        if (what == RemoveOurs) {
            disk.remove(music, ours);
        } else if (const auto file = *disk.find(music, ours); disk.available() > 100) {
            disk.append(file, "x"); // and so it is theirs
            disk.sync(file);
            others[ours] = {disk.read(file), disk.status(file).modified};
            device().contentsOfOthers.insert(disk.read(file));
        }
        device().rereadFilesOfOthers(); // it may have been a second name of one
    } else if (!others.empty()) {
        const auto [name, contents] =
            *std::next(others.begin(), static_cast<std::ptrdiff_t>(random.below(others.size())));
        const auto wanted = wantedName(random);
        if (what == RemoveFileOfOthers) {
            disk.remove(music, name);
            device().removeFileOfOthers(name);
            device().rereadFilesOfOthers(); // a second name of it has lost its contents
        } else if (!contents.first.empty() && !disk.find(music, wanted)) {
            disk.rename(music, name, music, wanted);
            device().removeFileOfOthers(name);
            others[wanted] = contents;
        }
    }
}

void World::happenToEngine(const Event& event) {
    switch (event.what) {
    case KillEngine:
        endEngine(End::Killed, event.seed);
        break;
    case EndEngine:
        endEngine(End::Orderly, event.seed);
        break;
    case LosePower:
        endEngine(End::PowerLost, event.seed);
        break;
    case StartNow:
        turns_.call([this] {
            try {
                engine_->startNow();
            } catch (const syncd::NotReady&) {
                // The client is told why.
            }
        });
        break;
    case Cancel:
        isCancelled_ = true;
        note(Trouble::Cancelled);
        turns_.call([this] { announcer_.cancel(); });
        break;
    case RemoveMusic:
        note(Trouble::OtherChoice);
        turns_.call([this] {
            try {
                engine_->removeMusic();
            } catch (const syncd::NotReady&) {
                // The client is told why.
            }
        });
        break;
    default:
        break;
    }
}

} // namespace quorl::simulation
