// The first and only program of a user-mode Linux: syncs to a wearable on a real file system, then
// lives through every loss of power that this could have met. tools/power-cuts starts it.
//
//   power-cut-guest FILE_SYSTEM BLOCK_LOG
//
// /dev/ubda is the wearable, whose writes are recorded in BLOCK_LOG; /dev/ubdb is as large.

#include <algorithm>
#include <cerrno>
#include <fstream>
#include <iostream>
#include <memory>
#include <sstream>
#include <system_error>

#include <fcntl.h>
#include <sys/mount.h>
#include <sys/reboot.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <sys/utsname.h>
#include <unistd.h>

#include "services/base/AtomicFile.h"
#include "services/wearable/Generations.h"
#include "tests/engine/Folders.h"
#include "tests/power/BlockLog.h"

namespace {

using namespace quorl;
using namespace quorl::power;
using namespace quorl::syncd::testing;

constexpr auto recordedDisk = "/dev/ubda";
constexpr auto replayedDisk = "/dev/ubdb";
const std::filesystem::path room = "/mnt";
const std::filesystem::path wearableRoot = room / "wearable";
const auto foreignFile = wearableRoot / "Photos/foreign.jpg";
constexpr auto foreignText = "not ours";

void require(long result, const std::string& what) {
    if (result < 0) {
        throw std::system_error(errno, std::generic_category(), what);
    }
}

void loadModule(const std::string& name) {
    utsname system{};
    require(uname(&system), "uname");
    const auto path =
        std::string("/usr/lib/uml/modules/") + system.release + "/kernel/fs/" + name + ".ko";
    const base::FileDescriptor file(open(path.c_str(), O_RDONLY | O_CLOEXEC));
    require(syscall(SYS_finit_module, file.get(), "", 0), path);
}

class Mounted {
  public:
    Mounted(const char* disk, const std::string& fileSystem) {
        if (fileSystem != "vfat") {
            // As a system does when it starts.
            const auto mend = "/sbin/fsck." + fileSystem + " -y " + disk + " >/dev/null 2>&1";
            static_cast<void>(std::system(mend.c_str()));
        }
        const auto* const options = fileSystem == "vfat" ? "utf8" : "";
        require(mount(disk, wearableRoot.c_str(), fileSystem.c_str(), 0, options), "mount");
    }

    ~Mounted() { umount(wearableRoot.c_str()); }

    Mounted(const Mounted&) = delete;
    Mounted& operator=(const Mounted&) = delete;
};

/// What somebody chose, and what the wearable has to hold once it was sent.
struct Choice {
    syncd::Order order;
    Contents contents;
    /// Writes to the disk when the sync had ended.
    std::size_t writesWhenSent = 0;
};

Choice choice(Music& music, const std::vector<std::string>& songs) {
    music.list(songs);
    Choice chosen{wishFor(music, Player(std::nullopt)), {}};
    chosen.order.wearable = {wearableRoot, std::nullopt, true};
    std::string playlist = "#EXTM3U\n#PLAYLIST:List\n";
    for (const auto& song : songs) {
        chosen.contents[song] = textOf(music.path() / song);
        playlist += song + "\n";
    }
    chosen.contents["List.m3u8"] = playlist;
    return chosen;
}

void requireSent(const syncd::Outcome& outcome) {
    if (outcome.kind != syncd::Outcome::Kind::Sent) {
        throw std::runtime_error("the sync has failed: " + engine::sentence(outcome.message));
    }
}

Contents onWearable() { return contentsOf(wearableRoot / wearable::musicDirectory); }

/// The songs of a choice and its playlist.
void requireThere(const Choice& choice, const Contents& there) {
    for (const auto& [name, text] : choice.contents) {
        const auto found = there.find(name);
        if (found == there.end() || found->second != text) {
            throw std::runtime_error(name + " is not there as it was sent");
        }
    }
}

class Trial {
  public:
    Trial(std::string fileSystem, std::filesystem::path log)
        : fileSystem_(std::move(fileSystem)), logFile_(std::move(log)) {
        music_.write("A longer name than eight.mp3", std::string(40'000, 'a'));
        music_.write("two.mp3", std::string(9'000, 'b'));
        music_.write("three.mp3", std::string(3'000, 'c'));
        for (const auto& songs :
             std::vector<std::vector<std::string>>{{"A longer name than eight.mp3", "two.mp3"},
                                                   {"two.mp3", "three.mp3"},
                                                   {"three.mp3", "two.mp3"}}) {
            songs_.push_back(songs);
        }
    }

    /// Syncs each choice once. The file of others is there before.
    void record() {
        disk_ = textOf(recordedDisk);
        const Mounted mounted(recordedDisk, fileSystem_);
        std::filesystem::create_directories(foreignFile.parent_path());
        std::ofstream(foreignFile) << foreignText;
        sync();
        begin_ = writes();
        for (const auto& songs : songs_) {
            auto chosen = choice(music_, songs);
            requireSent(syncd::testing::sync(chosen.order));
            chosen.writesWhenSent = writes();
            choices_.push_back(chosen);
        }
    }

    /// Gives back how many losses of power have broken something.
    int replay() {
        log_ = parseBlockLog(textOf(logFile_));
        int broken = 0;
        int lived = 0;
        for (const auto& cut : powerCuts(log_)) {
            if (cut.whole >= begin_) {
                ++lived;
                broken += live(cut) ? 0 : 1;
            }
        }
        std::cout << fileSystem_ << ": " << log_.writes.size() - begin_ << " writes, " << lived
                  << " losses of power, " << broken << " of them bad; " << leftovers_
                  << " left a file behind" << std::endl;
        return broken;
    }

  private:
    [[nodiscard]] std::size_t writes() const {
        return parseBlockLog(textOf(logFile_)).writes.size();
    }

    bool live(const PowerCut& cut) {
        try {
            putDisk(cut);
            const Mounted mounted(replayedDisk, fileSystem_);
            requirePromises(cut);
            requireNextSync();
            return true;
        } catch (const std::exception& error) {
            std::cout << fileSystem_ << " " << toText(cut) << ": " << error.what() << std::endl;
            return false;
        }
    }

    void putDisk(const PowerCut& cut) const {
        auto disk = disk_;
        apply(log_, cut, disk);
        std::ofstream stream(replayedDisk, std::ios::binary);
        stream.exceptions(std::ios::failbit | std::ios::badbit);
        stream << disk << std::flush;
    }

    void requirePromises(const PowerCut& cut) const {
        if (textOf(foreignFile) != foreignText) {
            throw std::runtime_error("the file of others is not as it was");
        }
        const auto wrong = whatIsWrongWith(wearableRoot);
        if (!wrong.empty()) {
            throw std::runtime_error(wrong);
        }
        const auto root = base::openRoot(wearableRoot.c_str());
        const auto sent = wearable::loadManifest(root.get()).sent;
        for (const auto& choice : choices_) {
            if (sent == choice.order.selection) {
                requireThere(choice, onWearable());
            } else if (cut == PowerCut{choice.writesWhenSent}) {
                throw std::runtime_error("what was said to be sent is forgotten");
            }
        }
    }

    void requireNextSync() {
        auto last = choice(music_, songs_.back());
        requireSent(syncd::testing::sync(last.order));
        auto there = onWearable();
        requireThere(last, there);
        const auto left = std::erase_if(
            there, [](const auto& file) { return syncd::Device::isUnfinished(file.first); });
        leftovers_ += left > 0 ? 1 : 0;
        if (there.size() != last.contents.size()) {
            throw std::runtime_error("there is more than was chosen");
        }
    }

    const std::string fileSystem_;
    const std::filesystem::path logFile_;
    Music music_;
    std::vector<std::vector<std::string>> songs_;
    std::vector<Choice> choices_;
    std::string disk_;
    BlockLog log_;
    std::size_t begin_ = 0;
    int leftovers_ = 0;
};

void prepare(const std::string& fileSystem) {
    require(mount("tmpfs", room.c_str(), "tmpfs", 0, ""), "tmpfs");
    require(setenv("TMPDIR", room.c_str(), 1), "setenv");
    require(setenv("XDG_DATA_DIRS", "/usr/local/share:/usr/share", 1), "setenv");
    std::filesystem::create_directory(wearableRoot);
    if (fileSystem == "vfat") {
        for (const auto* name : {"nls/nls_cp437", "nls/nls_iso8859-1", "fat/fat", "fat/vfat"}) {
            loadModule(name);
        }
    }
}

int run(const std::string& fileSystem, const std::string& log) {
    prepare(fileSystem);
    Trial trial(fileSystem, log);
    trial.record();
    return trial.replay();
}

} // namespace

/// More arguments may follow, which the kernel has added.
int main(int /*count*/, char** arguments) {
    try {
        const auto broken = run(arguments[1], arguments[2]);
        std::cout << (broken == 0 ? "Every promise was kept." : "Promises were broken.")
                  << std::endl;
    } catch (const std::exception& error) {
        std::cout << "The trial itself failed: " << error.what() << std::endl;
    }
    reboot(RB_POWER_OFF);
}
