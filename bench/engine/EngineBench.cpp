// Compares a sync of a whole playlist with `cp` and `sync -f` of the same files, in one run and in
// turns, so that the figures do not depend on the machine.
//
//     quorl-engine-bench [DIRECTORY [SONGS [MEGABYTES-EACH]]]
//
// Everything is made in DIRECTORY, which must not exist yet, or in a temporary one, and deleted.

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <random>
#include <stdexcept>
#include <string>
#include <vector>

#include <unistd.h>

#include "quorl-syncd/transfer/Sync.h"
#include "quorl-syncd/transfer/device/PosixVolume.h"
#include "quorl-syncd/transfer/pace/RateLimit.h"
#include "quorl-syncd/transfer/pace/SteadyClock.h"
#include "quorl-syncd/transfer/songs/PosixSongSource.h"
#include "services/media/MusicFolder.h"

namespace {

using namespace quorl;
using Seconds = std::chrono::duration<double>;

constexpr int rounds = 5;
constexpr std::uint64_t noLimit = 99;

void makeLibrary(const std::filesystem::path& root, int songs, std::size_t bytes) {
    std::filesystem::create_directories(root);
    std::mt19937_64 random{1};
    std::string text(bytes, '\0');
    std::ofstream playlist{root / "All.m3u8"};
    for (int song = 0; song < songs; ++song) {
        for (std::size_t at = 0; at + sizeof(std::uint64_t) <= bytes; at += 64) {
            const auto number = random();
            std::copy_n(reinterpret_cast<const char*>(&number), sizeof number, &text[at]);
        }
        const auto name = std::to_string(song) + ".mp3";
        std::ofstream{root / name, std::ios::binary} << text;
        playlist << name << '\n';
    }
}

void run(const std::string& command) {
    if (std::system(command.c_str()) != 0) {
        throw std::runtime_error{"failed: " + command};
    }
}

template <class Act>
double secondsOf(Act act) {
    const auto begun = std::chrono::steady_clock::now();
    act();
    return Seconds{std::chrono::steady_clock::now() - begun}.count();
}

double secondsOfCopy(const std::filesystem::path& music, const std::filesystem::path& target) {
    std::filesystem::create_directories(target);
    const auto to = target.string();
    return secondsOf(
        [&] { run("cp '" + music.string() + "'/*.mp3 '" + to + "' && sync -f '" + to + "'"); });
}

double secondsOfSync(const std::filesystem::path& music, const std::filesystem::path& target) {
    std::filesystem::create_directories(target);
    const auto library = media::scan(music);
    const auto& playlist = library->playlists.front();
    const syncd::Order order{library,
                             {playlist.id, playlist.revision, noLimit, 0},
                             wearable::Wearable{target, {}, false}};
    syncd::RateLimit rate;
    syncd::PosixSongSource songs;
    const syncd::SteadyClock clock;
    const syncd::SyncPorts ports{
        [](const auto& wearable) { return std::make_unique<syncd::PosixVolume>(wearable); }, songs,
        rate, clock};
    return secondsOf([&] {
        const auto outcome = syncd::Sync(order, ports, {}, [](const syncd::CopyProgress&) {}).run();
        if (outcome.kind != syncd::Outcome::Kind::Sent) {
            throw std::runtime_error{engine::sentence(outcome.message)};
        }
    });
}

double median(std::vector<double> values) {
    std::ranges::sort(values);
    return values[values.size() / 2];
}

void compare(const std::filesystem::path& root, int songs, std::size_t bytes) {
    const auto music = root / "music";
    makeLibrary(music, songs, bytes);
    run("sync -f '" + root.string() + "'");
    std::vector<double> copies;
    std::vector<double> syncs;
    for (int round = 0; round < rounds; ++round) {
        // In turns, and each first in every other round.
        for (const bool isSync : {round % 2 == 0, round % 2 != 0}) {
            const auto target = root / "target";
            if (isSync) {
                syncs.push_back(secondsOfSync(music, target));
            } else {
                copies.push_back(secondsOfCopy(music, target));
            }
            std::filesystem::remove_all(target);
            run("sync -f '" + root.string() + "'");
        }
    }
    const auto megabytes = static_cast<double>(songs) * static_cast<double>(bytes) / 1e6;
    std::printf("%d songs of %.1f MB: cp and sync %.0f MB/s, engine %.0f MB/s, ratio %.2f "
                "(medians of %d)\n",
                songs, static_cast<double>(bytes) / 1e6, megabytes / median(copies),
                megabytes / median(syncs), median(copies) / median(syncs), rounds);
}

} // namespace

int main(int argc, char** argv) {
    const auto root = argc > 1 ? std::filesystem::path{argv[1]}
                               : std::filesystem::temp_directory_path() /
                                     ("quorl-engine-bench-" + std::to_string(getpid()));
    constexpr std::size_t megabyte = 1'000'000;
    const int songs = argc > 2 ? std::atoi(argv[2]) : 60;
    const auto bytes = (argc > 3 ? static_cast<std::size_t>(std::atoi(argv[3])) : 5) * megabyte;
    try {
        compare(root, songs, bytes);
    } catch (const std::exception& error) {
        std::fprintf(stderr, "quorl-engine-bench: %s\n", error.what());
    }
    std::filesystem::remove_all(root);
}
