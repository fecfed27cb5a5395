// Compares reading a large music folder with what `find` needs for the same files, in one run, so
// that the figures do not depend on the machine: 50,000 songs in 2,500 directories, and 1,000
// playlists with 100 entries each.
//
//     quorl-media-bench [DIRECTORY]
//
// The library is made in DIRECTORY, which must not exist yet, or in a temporary one, and deleted.

#include <algorithm>
#include <array>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>
#include <future>
#include <stdexcept>
#include <string>

#include <unistd.h>

#include "services/media/MusicFolder.h"

namespace {

using Clock = std::chrono::steady_clock;
using Milliseconds = std::chrono::duration<double, std::milli>;

constexpr int artists = 500;
constexpr int albumsEach = 4;
constexpr int songsEach = 25;
constexpr int playlists = 1000;
constexpr int entriesEach = 100;

std::string albumPath(int artist, int album) {
    return "Artist number " + std::to_string(artist) + "/Album number " + std::to_string(album);
}

std::string songName(int song) {
    return std::to_string(song + 10) + " - A song of usual length.mp3";
}

void makeLibrary(const std::filesystem::path& root) {
    for (int artist = 0; artist < artists; ++artist) {
        for (int album = 0; album < albumsEach; ++album) {
            const std::filesystem::path directory = root / albumPath(artist, album);
            std::filesystem::create_directories(directory);
            for (int song = 0; song < songsEach; ++song) {
                std::ofstream(directory / songName(song)) << song;
            }
        }
    }
    std::filesystem::create_directories(root / "Playlists");
    constexpr int songs = artists * albumsEach * songsEach;
    for (int playlist = 0; playlist < playlists; ++playlist) {
        std::ofstream file(root / "Playlists" / ("Playlist " + std::to_string(playlist) + ".m3u8"));
        file << "#EXTM3U\n";
        for (int entry = 0; entry < entriesEach; ++entry) {
            // Far apart, and over all playlists every song.
            const int song = (playlist * entriesEach + entry) * 7919 % songs;
            const int album = song / songsEach;
            file << "#EXTINF:180,A song\n../" << albumPath(album / albumsEach, album % albumsEach)
                 << '/' << songName(song % songsEach) << '\n';
        }
    }
}

Milliseconds timeOf(const std::function<void()>& act) {
    const Clock::time_point begin = Clock::now();
    act();
    return Clock::now() - begin;
}

void runFind(const std::filesystem::path& root) {
    const std::string command =
        "exec find '" + root.string() + "' -type f -printf '%s %T@\\n' >/dev/null";
    // NOLINTNEXTLINE(concurrency-mt-unsafe): nobody changes the handling of signals here
    if (std::system(command.c_str()) != 0) {
        throw std::runtime_error("find failed.");
    }
}

/// The median, in turn so that both meet the same state of the machine.
void compareTimes(const std::filesystem::path& root) {
    constexpr std::size_t rounds = 11;
    std::array<Milliseconds, rounds> find{};
    std::array<Milliseconds, rounds> scan{};
    std::shared_ptr<const quorl::media::Inventory> inventory;
    runFind(root);
    for (std::size_t round = 0; round < rounds; ++round) {
        find[round] = timeOf([&] { runFind(root); });
        scan[round] = timeOf([&] { inventory = quorl::media::scan(root); });
    }
    std::ranges::sort(find);
    std::ranges::sort(scan);
    std::printf("found:  %zu songs, %zu playlists and folders, %zu left out\n",
                inventory->songs.size(), inventory->playlists.size(), inventory->leftOut.size());
    std::printf("find:   %.1f ms\n", find[rounds / 2].count());
    std::printf("scan:   %.1f ms, %.2f times find\n", scan[rounds / 2].count(),
                scan[rounds / 2] / find[rounds / 2]);
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
    const auto watch = [](const std::filesystem::path& folder) {
        auto music = std::make_unique<quorl::media::MusicFolder>(folder, nullptr);
        std::promise<void> done;
        music->rescan([&done] { done.set_value(); });
        done.get_future().wait();
        return music;
    };
    const auto empty = watch(root / albumPath(0, 0));
    const double before = residentMegabytes();
    const auto music = watch(root);
    std::printf("memory: %.1f MB resident for the watched folder\n", residentMegabytes() - before);

    const std::filesystem::path extra = root / "Playlists" / "Extra.m3u8";
    const Milliseconds rescan = timeOf([&] {
        std::promise<void> done;
        music->rescan([&done] { done.set_value(); });
        done.get_future().wait();
    });
    std::printf("rescan: %.1f ms\n", rescan.count());
    std::printf("memory: %.1f MB resident after a rescan\n", residentMegabytes() - before);
}

} // namespace

int main(int argc, char** argv) {
    std::string root = std::filesystem::temp_directory_path() / "quorl-media-bench-XXXXXX";
    if (argc > 1) {
        root = argv[1];
        if (!std::filesystem::create_directory(root)) {
            std::fprintf(stderr, "%s is there already.\n", root.c_str());
            return 1;
        }
    } else if (mkdtemp(root.data()) == nullptr) {
        std::perror("mkdtemp");
        return 1;
    }
    makeLibrary(root);
    measureMemory(root);
    compareTimes(root);
    std::filesystem::remove_all(root);
}
