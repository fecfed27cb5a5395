// The engine is killed again and again while it works.

#include <chrono>
#include <csignal>
#include <fstream>
#include <iostream>
#include <random>
#include <thread>

#include "services/base/AtomicFile.h"
#include "services/wearable/Generations.h"
#include "tests/engine/EngineFixture.h"

namespace {

using namespace quorl;
using namespace quorl::syncd::testing;
using Kind = Event::Kind;

constexpr int songs = 12;

/// In the middle of a sync. Set for a long run.
int kills() {
    constexpr int some = 200;
    const auto* const number = std::getenv("QUORL_KILLS");
    return number == nullptr ? some : std::stoi(number);
}

class KilledEngine : public EngineTest {
  protected:
    /// Another selection of songs, some of them with new contents, so that there is something to
    /// copy and something to remove.
    void changeThePlaylist() {
        std::vector<std::string> names;
        for (int song = 0; song < songs; ++song) {
            const auto name = std::to_string(song) + ".mp3";
            if (random_() % 3 == 0) {
                music_.write(name, std::string(1000 + random_() % 100'000, 'x') +
                                       std::to_string(random_()));
            }
            if (random_() % 2 == 0) {
                names.push_back(name);
            }
        }
        music_.list(names);
    }

    // Always the same numbers, so that a failure comes again.
    std::mt19937 random_{20'240'229};
};

TEST_F(KilledEngine, LeavesNothingHalfAndNothingOfOthersTouchedAndCompletesInTheEnd) {
    for (int song = 0; song < songs; ++song) {
        music_.write(std::to_string(song) + ".mp3", std::to_string(song));
    }
    const Contents foreign{{"0.mp3", "not ours"}, {"5 (2).MP3", "not ours"}, {"x/y.mp3", "no"}};
    for (const auto& [name, text] : foreign) {
        std::filesystem::create_directories((wearable_ / "Music" / name).parent_path());
        std::ofstream{wearable_ / "Music" / name} << text;
    }
    music_.list({"0.mp3"});
    choose();
    constexpr std::chrono::microseconds longest{20'000};

    int incomplete = 0;
    for (int kill = 0; kill < kills();) {
        changeThePlaylist();
        Process engine{{ENGINE_PROGRAM, "--music-folder", music_.path()}};
        recorder_.next(Kind::EngineDidAppear);
        recorder_.awaitState([](const auto& state) {
            return !state.sessions.empty() || state.engine.status == "Everything is up to date.";
        });
        // The moment is what this test is about; whichever it is, the same must hold.
        std::this_thread::sleep_for(longest * (random_() % 1000) / 1000);
        kill += recorder_.state().sessions.empty() ? 0 : 1;
        engine.signal(SIGKILL);
        engine.wait();
        recorder_.next(Kind::EngineDidVanish);

        ASSERT_EQ(whatIsWrongWith(wearable_), "") << "at kill " << kill;
        const auto root = base::openRoot(wearable_.c_str());
        incomplete += wearable::loadManifest(root.get()).strays.empty() ? 0 : 1;
        const auto there = onWearable();
        for (const auto& [name, text] : foreign) {
            ASSERT_TRUE(there.contains(name) && there.at(name) == text)
                << name << " at kill " << kill;
        }
    }
    std::cout << kills() << " kills, " << incomplete << " of them in the middle of a change\n";
    EXPECT_GT(incomplete, 0) << "no kill left anything half done, so nothing was tested";
    // Not what any round has sent.
    music_.write("0.mp3", "the last");
    music_.list({"0.mp3", "1.mp3", "2.mp3"});
    start();
    EXPECT_TRUE(sessionEnd().success);

    const auto order = wishFor(music_, Player{});
    EXPECT_EQ(onWearable().size(), foreign.size() + order.playlist().songs.size() + 1)
        << "nothing is left behind";
    EXPECT_EQ(whatIsWrongWith(wearable_), "");
}

} // namespace
