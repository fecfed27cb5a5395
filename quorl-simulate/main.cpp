// quorl-simulate: lives through many lives of the sync engine, and tells which of them broke a
// promise.

#include <chrono>
#include <cstdint>
#include <iostream>
#include <map>
#include <string>

#include <CLI/CLI.hpp>

#include "quorl-simulate/Shrinker.h"
#include "quorl-simulate/World.h"

namespace {

using namespace quorl::simulation;

struct Options {
    std::uint64_t seed = 1;
    std::uint64_t lives = 1;
    std::size_t events = 120;
    std::string device = "posix";
    std::string life;
    bool isTraced = false;
};

struct Totals {
    std::uint64_t lives = 0;
    std::uint64_t broken = 0;
    std::uint64_t operations = 0;
    std::uint64_t syncs = 0;
};

void tell(const Life& life, const Breach& breach) {
    std::cout << "Broken: " << breach.what << "\n  " << toText(life) << "\nThe wearable before:\n"
              << breach.wearableBefore << "and after:\n"
              << breach.wearable;
}

/// The same promise, so that the shortest list is about what was found.
bool breaksAlike(const Life& life, const std::string& what) {
    const auto kind = what.substr(0, what.find(':'));
    const auto breach = liveOnce(life).breach;
    return breach && breach->what.starts_with(kind);
}

void live(const Life& life, const Options& options, Totals& totals) {
    Trace trace;
    if (options.isTraced) {
        trace = [](const std::string& line) { std::cout << line << '\n'; };
    }
    const auto result = liveOnce(life, trace);
    ++totals.lives;
    totals.operations += result.operations;
    totals.syncs += result.syncs;
    if (!result.breach) {
        return;
    }
    ++totals.broken;
    const auto what = result.breach->what;
    const auto shortest = shrunk(life, [&](const Life& each) { return breaksAlike(each, what); });
    tell(shortest, *liveOnce(shortest, [](const std::string&) {}).breach);
}

DiskRules rulesOf(const Options& options) {
    return options.device == "fat" ? DiskRules::Fat : DiskRules::Posix;
}

int simulate(const Options& options) {
    const auto begun = std::chrono::steady_clock::now();
    Totals totals;
    if (const auto given = parseLife(options.life)) {
        live(*given, options, totals);
    } else {
        for (auto seed = options.seed; seed < options.seed + options.lives; ++seed) {
            live(drawLife(seed, rulesOf(options), options.events), options, totals);
        }
    }
    const std::chrono::duration<double> time = std::chrono::steady_clock::now() - begun;
    std::cout << totals.lives << " lives, " << totals.broken << " broken, " << totals.syncs
              << " syncs, " << totals.operations << " operations, " << time.count() << " s\n";
    return totals.broken == 0 ? 0 : 1;
}

} // namespace

int main(int argc, char** argv) {
    Options options;
    CLI::App program("Lives through many lives of the sync engine in a simulated world.");
    program.add_option("--seed", options.seed, "what the first life follows from")
        ->capture_default_str();
    program.add_option("--lives", options.lives, "how many lives, from this seed on")
        ->capture_default_str();
    program.add_option("--events", options.events, "how much happens in each")
        ->capture_default_str();
    program.add_option("--device", options.device, "the file system of the wearable")
        ->check(CLI::IsMember({"posix", "fat"}))
        ->capture_default_str();
    program.add_option("--life", options.life, "a life as it is printed where it is broken");
    program.add_flag("--trace", options.isTraced, "print all that happens");
    CLI11_PARSE(program, argc, argv);
    return simulate(options);
}
