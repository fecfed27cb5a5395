// No thread can be started any more.

#include <future>

#include <gtest/gtest.h>
#include <sys/resource.h>
#include <unistd.h>

#include "quorl-syncd/daemon/SyncThreads.h"
#include "tests/engine/Folders.h"

namespace {

using namespace quorl;
using namespace quorl::syncd;
using namespace quorl::syncd::testing;

constexpr uid_t nobody = 65534;

/// Only an ordinary user can run out of threads.
void runOutOfThreads() {
    if (geteuid() == 0 && setresuid(nobody, nobody, nobody) != 0) {
        _exit(1);
    }
    const rlimit none{1, 1};
    if (setrlimit(RLIMIT_NPROC, &none) != 0) {
        _exit(1);
    }
}

/// In a process of its own.
[[noreturn]] void syncWithoutThreads() {
    Music music;
    music.list({});
    const Player player;
    const auto order = wishFor(music, player);
    engine::BusLoop loop(nullptr);
    SyncThreads syncs(loop, [] { return nullptr; });
    runOutOfThreads();
    Outcome outcome;
    const auto running = syncs.begin(
        order, [](const CopyProgress&) {},
        [&](const Outcome& ended) {
            outcome = ended;
            loop.stop();
        });
    static_cast<void>(loop.run());
    std::cerr << engine::sentence(outcome.message);
    _exit(outcome.kind == Outcome::Kind::Failed && outcome.mayPass ? 0 : 2);
}

TEST(ASyncWithoutAThread, EndsInASentenceAndIsTriedAgain) {
    EXPECT_EXIT(syncWithoutThreads(), ::testing::ExitedWithCode(0),
                "The Velora could not be synced: Resource temporarily unavailable\\.");
}

} // namespace
