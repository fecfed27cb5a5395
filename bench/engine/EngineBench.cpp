// Compares syncs with `cp` of the same files, in turn in one run, so that the figures do not depend
// on the machine: of many small songs and of few large ones, until they outlive a loss of power;
// and one in which nothing has changed. Tells what memory a song takes meanwhile.
//
//     quorl-engine-bench [--rounds N] [--songs N] [DIRECTORY]
//
// Everything is made in DIRECTORY, or in the one for temporary files, and deleted. There are 20,000
// small songs, or as many as `--songs` says, and a hundredth of large ones. Each figure is a line
// of JSON: medians, and the ratios of the quarter of the rounds that did best and of the quarter
// that did worst.

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <random>
#include <stdexcept>
#include <string>
#include <vector>

#include <CLI/CLI.hpp>
#include <malloc.h>
#include <sys/wait.h>
#include <unistd.h>

#include "bench/Comparison.h"
#include "quorl-syncd/transfer/Sync.h"
#include "quorl-syncd/transfer/device/PosixVolume.h"
#include "quorl-syncd/transfer/pace/RateLimit.h"
#include "quorl-syncd/transfer/pace/SteadyClock.h"
#include "quorl-syncd/transfer/songs/PosixSongSource.h"
#include "services/media/MusicFolder.h"

namespace {

using namespace quorl;
using namespace quorl::bench;
using std::filesystem::path;

constexpr std::uint64_t noLimit = 99;
constexpr std::size_t small = 10'000;
constexpr std::size_t large = 5'000'000;

std::string songPath(int song) {
    constexpr int songsOfAlbum = 20;
    return "Album number " + std::to_string(song / songsOfAlbum) + "/" +
           std::to_string(song % songsOfAlbum + 10) + " - Song " + std::to_string(song) + ".mp3";
}

void makeLibrary(const path& root, int songs, std::size_t bytes) {
    std::filesystem::create_directories(root);
    std::mt19937_64 random{1};
    std::string text(bytes, '\0');
    std::ofstream playlist{root / "All.m3u8"};
    for (int song = 0; song < songs; ++song) {
        for (std::size_t at = 0; at + sizeof(std::uint64_t) <= bytes; at += 64) {
            const auto number = random();
            std::copy_n(reinterpret_cast<const char*>(&number), sizeof number, &text[at]);
        }
        std::filesystem::create_directories((root / songPath(song)).parent_path());
        std::ofstream{root / songPath(song), std::ios::binary} << text;
        playlist << songPath(song) << '\n';
    }
}

std::string quoted(const path& file) { return "'" + file.string() + "'"; }

void copyAll(const path& music, const path& target) {
    const auto to = quoted(target);
    run("cp -r " + quoted(music) + " " + to + " && sync -f " + to);
}

void update(const path& music, const path& target) {
    run("exec cp -ru " + quoted(music) + "/. " + quoted(target));
}

/// All songs of a library, to be synced any number of times.
class Sending {
  public:
    explicit Sending(const path& music) : library_(media::scan(music)) {}

    void to(const path& target) {
        const auto& playlist = library_->playlists.front();
        const syncd::Order order{library_,
                                 {playlist.id, playlist.revision, noLimit, 0},
                                 wearable::Wearable{target, {}, false}};
        const syncd::SyncPorts ports{
            [](const auto& wearable) { return std::make_unique<syncd::PosixVolume>(wearable); },
            songs_, rate_, clock_};
        const auto outcome = syncd::Sync(order, ports, {}, [](const syncd::CopyProgress&) {}).run();
        if (outcome.kind != syncd::Outcome::Kind::Sent) {
            throw std::runtime_error{engine::sentence(outcome.message)};
        }
    }

  private:
    const std::shared_ptr<const media::Inventory> library_;
    syncd::RateLimit rate_;
    syncd::PosixSongSource songs_;
    const syncd::SteadyClock clock_;
};

void makeQuiet(const path& root) { run("sync -f " + quoted(root)); }

/// A virtual machine's host takes back memory that is not in use, and is slow to give it again: who
/// copies first would pay for all. So have files been there just before, of which nothing is left.
void warmMemory(const path& root, std::size_t bytes) {
    const auto scratch = root / "scratch";
    const std::string text(large, ' ');
    std::ofstream file{scratch, std::ios::binary};
    for (std::size_t written = 0; written < bytes; written += text.size()) {
        file << text;
    }
    file.close();
    std::filesystem::remove(scratch);
}

void compareCopies(const path& root, Sending& sending, int rounds, std::size_t bytes,
                   const std::string& what) {
    Comparison wall;
    const auto target = root / "target";
    const auto timeOfOne = [&](bool isSync) {
        if (isSync) {
            std::filesystem::create_directories(target);
        }
        warmMemory(root, bytes);
        const auto time = timeOf([&] {
            if (isSync) {
                sending.to(target);
            } else {
                copyAll(root / "music", target);
            }
        });
        std::filesystem::remove_all(target);
        makeQuiet(root);
        return time;
    };
    for (int round = 0; round < rounds; ++round) {
        // What the disk has still to do for the one before falls to each of them alike.
        const auto first = timeOfOne(true);
        const auto copies = timeOfOne(false) + timeOfOne(false);
        wall.add(first + timeOfOne(true), copies);
    }
    wall.print(what, "cp -r, sync -f");
}

void compareUpdates(const path& root, Sending& sending, int rounds) {
    Comparison wall;
    Comparison processor;
    std::filesystem::create_directories(root / "target");
    sending.to(root / "target");
    copyAll(root / "music", root / "copies");
    for (int round = 0; round < rounds; ++round) {
        const auto before = processorTime();
        const auto beforeOfChildren = processorTime(RUSAGE_CHILDREN);
        const auto ours = timeOf([&] { sending.to(root / "target"); });
        const auto theirs = timeOf([&] { update(root / "music", root / "copies"); });
        wall.add(ours, theirs);
        processor.add(processorTime() - before, processorTime(RUSAGE_CHILDREN) - beforeOfChildren);
    }
    wall.print("a sync in which nothing has changed", "cp -ru");
    processor.print("a sync in which nothing has changed, processor time", "cp -ru");
}

/// Of this process; `name` as in the file.
std::uint64_t bytesInStatus(const std::string& name) {
    std::ifstream status("/proc/self/status");
    std::string word;
    while (status >> word && word != name + ":") {
    }
    std::uint64_t kilobytes = 0;
    status >> kilobytes;
    return kilobytes * 1024;
}

/// In a process of its own, so that nothing is counted that was there before.
void measureMemory(Sending& sending, const path& target, int songs, const std::string& what) {
    std::fflush(stdout);
    malloc_trim(0);
    const auto child = fork();
    if (child == 0) {
        std::ofstream("/proc/self/clear_refs") << 5 << std::flush; // the most is what there is now
        const auto before = bytesInStatus("VmRSS");
        sending.to(target);
        std::printf(R"({"memory":"%s","bytes a song":%.0f})"
                    "\n",
                    what.c_str(), static_cast<double>(bytesInStatus("VmHWM") - before) / songs);
        std::fflush(stdout);
        _exit(0);
    }
    int status = 0;
    if (child < 0 || waitpid(child, &status, 0) != child || status != 0) {
        throw std::runtime_error("The memory cannot be measured.");
    }
}

void measureMany(const path& root, int songs, int rounds) {
    makeLibrary(root / "music", songs, small);
    makeQuiet(root);
    Sending sending(root / "music");
    std::filesystem::create_directories(root / "first");
    measureMemory(sending, root / "first", songs, "the first sync");
    measureMemory(sending, root / "first", songs, "a sync in which nothing has changed");
    std::filesystem::remove_all(root / "first");
    compareUpdates(root, sending, rounds);
    std::filesystem::remove_all(root / "target");
    compareCopies(root, sending, rounds, static_cast<std::size_t>(songs) * small,
                  "a sync of " + std::to_string(songs) + " songs of 10 kB");
}

void measureLarge(const path& root, int songs, int rounds) {
    makeLibrary(root / "music", songs, large);
    makeQuiet(root);
    Sending sending(root / "music");
    compareCopies(root, sending, rounds, static_cast<std::size_t>(songs) * large,
                  "a sync of " + std::to_string(songs) + " songs of 5 MB");
}

} // namespace

int main(int argc, char** argv) {
    int rounds = 5;
    int songs = 20'000;
    std::string directory;
    CLI::App program("Compares syncs with cp of the same files.", "quorl-engine-bench");
    program.add_option("--rounds", rounds);
    program.add_option("--songs", songs);
    program.add_option("directory", directory);
    CLI11_PARSE(program, argc, argv);

    if (!directory.empty()) {
        setenv("TMPDIR", directory.c_str(), 1);
    }
    const Temporary temporary("quorl-engine-bench");
    measureMany(temporary.path() + "/many", songs, rounds);
    std::filesystem::remove_all(temporary.path() + "/many");
    measureLarge(temporary.path() + "/large", songs / 100, rounds);
}
