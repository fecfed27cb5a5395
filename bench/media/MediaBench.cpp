// Compares the music folder with the bare minimum for the same files, in turn in one run, so that
// the figures do not depend on the machine. The library has 50,000 songs in 2,000 directories, and
// 1,000 playlists with 100 entries each.
//
//     quorl-media-bench [--rounds N] [--growth SECONDS] [DIRECTORY]
//
// The library is made in DIRECTORY and kept there for the next time, or in a temporary one and
// deleted. Each figure is a line of JSON: medians, and the ratios of the quarter of the rounds that
// did best and of the quarter that did worst. With `--growth` one more: how long a scan takes for
// ever more songs, as far as that can be found out in so many seconds.

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>
#include <future>
#include <semaphore>
#include <stdexcept>
#include <string>
#include <vector>

#include <CLI/CLI.hpp>
#include <poll.h>
#include <sys/stat.h>
#include <unistd.h>

#include "bench/Comparison.h"
#include "services/base/DirectoryWatch.h"
#include "services/base/FileStatus.h"
#include "services/media/MusicFolder.h"
#include "services/media/kept/KeptInventory.h"

namespace {

using namespace quorl::bench;

constexpr int artists = 500;
constexpr int albumsEach = 4;
constexpr int songsEach = 25;
constexpr int songsOfArtist = albumsEach * songsEach;
constexpr int entriesEach = 100;
constexpr auto quietTime = std::chrono::milliseconds(50);

std::string albumPath(int album) {
    return "Artist number " + std::to_string(album / albumsEach) + "/Album number " +
           std::to_string(album % albumsEach);
}

std::string songName(int song) {
    return std::to_string(song + 10) + " - A song of usual length.mp3";
}

std::string songPath(int song) {
    return albumPath(song / songsEach) + '/' + songName(song % songsEach);
}

void writePlaylist(const std::filesystem::path& root, int playlist, int songs) {
    std::ofstream file(root / "Playlists" / ("Playlist " + std::to_string(playlist) + ".m3u8"));
    file << "#EXTM3U\n";
    for (int entry = 0; entry < entriesEach; ++entry) {
        // Far apart, and over all playlists every song.
        const auto song = (std::int64_t{playlist} * entriesEach + entry) * 7919 % songs;
        file << "#EXTINF:180,A song\n../" << songPath(static_cast<int>(song)) << '\n';
    }
}

/// Adds the artists from `first` to before `end`, and the playlists for as many songs twice.
void growLibrary(const std::filesystem::path& root, int first, int end) {
    std::filesystem::create_directories(root / "Playlists");
    for (int album = first * albumsEach; album < end * albumsEach; ++album) {
        std::filesystem::create_directories(root / albumPath(album));
    }
    for (int song = first * songsOfArtist; song < end * songsOfArtist; ++song) {
        std::ofstream(root / songPath(song)) << song;
    }
    for (int playlist = 2 * first; playlist < 2 * end; ++playlist) {
        writePlaylist(root, playlist, end * songsOfArtist);
    }
}

void runFind(const std::filesystem::path& root) {
    run("exec find '" + root.string() + "' -type f -printf '%s %T@\\n' >/dev/null");
}

void compareScan(const std::filesystem::path& root, int rounds) {
    Comparison wall;
    Comparison processor;
    std::shared_ptr<const quorl::media::Inventory> inventory;
    runFind(root);
    for (int round = 0; round < rounds; ++round) {
        const Seconds before = processorTime();
        const Seconds beforeFind = processorTime(RUSAGE_CHILDREN);
        const Seconds find = timeOf([&] { runFind(root); });
        wall.add(timeOf([&] { inventory = quorl::media::scan(root); }), find);
        processor.add(processorTime() - before, processorTime(RUSAGE_CHILDREN) - beforeFind);
    }
    if (inventory->songs.size() != std::size_t{artists} * songsOfArtist ||
        !inventory->leftOut.empty()) {
        throw std::runtime_error("The scan did not find what there is.");
    }
    const std::string what = "scan of 50,000 files and 1,000 playlists";
    const std::string beside = "find -printf '%s %T@'";
    wall.print(what, beside);
    processor.print(what + ", processor time", beside);
}

/// What the next start shows before it has read the folder.
void compareKept(const std::filesystem::path& root, int rounds) {
    const Temporary temporary("quorl-kept");
    const std::filesystem::path file = temporary.path() + "/music-folder";
    quorl::media::keepInventory(file, *quorl::media::scan(root));
    Comparison wall;
    for (int round = 0; round < rounds; ++round) {
        std::shared_ptr<const quorl::media::Inventory> kept;
        const auto time = timeOf([&] { kept = quorl::media::keptInventory(file, root); });
        std::shared_ptr<const quorl::media::Inventory> read;
        wall.add(time, timeOf([&] { read = quorl::media::scan(root); }));
        if (!kept || *kept != *read) {
            throw std::runtime_error("What was kept is not what was read.");
        }
    }
    wall.print("what the last start has kept, of 50,000 files and 1,000 playlists", "their scan");
}

/// A music folder whose news can be waited for.
class Watched {
  public:
    explicit Watched(const std::filesystem::path& root)
        : folder_(root, [this](const auto& /*inventory*/) { told_.release(); }) {
        told_.acquire();
    }

    void waitUntilTold() { told_.acquire(); }

    void rescan() {
        std::promise<void> done;
        folder_.rescan([&done] { done.set_value(); });
        done.get_future().wait();
    }

  private:
    std::counting_semaphore<> told_{0};
    quorl::media::MusicFolder folder_;
};

/// Something that is done to a file.
struct Change {
    std::filesystem::path file;
    std::string appended;

    void make() const { std::ofstream(file, std::ios::app) << appended; }
};

/// The least that anybody can do who waits for quiet: a watch, the time, and a look at the file.
void waitBarely(const Change& change) {
    quorl::base::DirectoryWatch watch;
    static_cast<void>(watch.add(change.file.parent_path()));
    change.make();
    pollfd descriptor{watch.descriptor(), POLLIN, 0};
    while (poll(&descriptor, 1, static_cast<int>(quietTime.count())) > 0) {
        static_cast<void>(watch.take());
    }
    quorl::base::FileStatus status{};
    static_cast<void>(stat(change.file.c_str(), &status));
}

/// `changeOf` says what happens in a round.
void compareChange(const std::filesystem::path& root, int rounds, const std::string& what,
                   const std::function<Change(int)>& changeOf) {
    Watched watched(root);
    Comparison wall;
    Comparison processor;
    for (int round = 0; round < rounds; ++round) {
        const Change change = changeOf(round);
        const Seconds barely = timeOf([&] { waitBarely(change); });
        watched.waitUntilTold(); // of that, too
        const Seconds before = processorTime();
        wall.add(timeOf([&] {
                     change.make();
                     watched.waitUntilTold();
                 }),
                 barely);
        const Seconds after = processorTime();
        static_cast<void>(quorl::media::scan(root));
        processor.add(after - before, processorTime() - after);
    }
    wall.print(what + " until the pane is told", "a bare watch that waits as long for quiet");
    processor.print(what + ", processor time", "that of a scan");
}

double residentMegabytes() {
    std::ifstream statm("/proc/self/statm");
    long total = 0;
    long resident = 0;
    statm >> total >> resident;
    return static_cast<double>(resident * sysconf(_SC_PAGESIZE)) / 1e6;
}

/// What a watched folder keeps, on top of what the libraries need for an empty one.
void measureMemory(const std::filesystem::path& root) {
    const Watched empty(root / albumPath(0));
    const double before = residentMegabytes();
    Watched music(root);
    const double first = residentMegabytes() - before;
    music.rescan();
    std::printf(R"({"memory":"watched folder","megabytes":%.1f,"after a rescan":%.1f})"
                "\n",
                first, residentMegabytes() - before);
}

/// Doubles the library from a small one on, as long as the next step is likely to end in time.
void measureGrowth(const std::filesystem::path& root, double seconds) {
    constexpr int most = 10'000;
    const Clock::time_point begin = Clock::now();
    const char* separator = "";
    std::printf(R"({"growth":"scan","points":[)");
    int there = 0;
    for (int next = 60; next <= most; next *= 2) {
        growLibrary(root, there, next);
        there = next;
        std::vector<double> times;
        for (int round = 0; round < 3; ++round) {
            times.push_back(timeOf([&] { static_cast<void>(quorl::media::scan(root)); }).count());
        }
        std::printf("%s[%d,%.4f]", separator, there * songsOfArtist, quantile(times, 0.5));
        std::fflush(stdout);
        separator = ",";
        if (Seconds(Clock::now() - begin).count() * 3 > seconds) {
            break;
        }
    }
    std::printf("]}\n");
}

void measure(const std::filesystem::path& root, int rounds) {
    if (!std::filesystem::exists(root / "Playlists")) {
        growLibrary(root, 0, artists);
    }
    measureMemory(root);
    compareScan(root, rounds);
    compareKept(root, rounds);
    compareChange(root, rounds, "a song that was written again", [&](int round) {
        return Change{root / songPath(round * 7919), "."};
    });
    compareChange(root, rounds, "a playlist with a new entry", [&](int round) {
        const auto name = "Playlist " + std::to_string(round) + ".m3u8";
        return Change{root / "Playlists" / name, "../" + songPath(round) + '\n'};
    });
}

} // namespace

int main(int argc, char** argv) {
    int rounds = 11;
    double growth = 0;
    std::string directory;
    CLI::App program("Compares the music folder with the bare minimum for the same files.",
                     "quorl-media-bench");
    program.add_option("--rounds", rounds);
    program.add_option("--growth", growth);
    program.add_option("directory", directory);
    CLI11_PARSE(program, argc, argv);

    const Temporary temporary("quorl-media-bench");
    measure(directory.empty() ? temporary.path() + "/library" : directory, rounds);
    if (growth > 0) {
        measureGrowth(temporary.path() + "/growing", growth);
    }
}
