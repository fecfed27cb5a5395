// What the pane's frequent operations cost, and ratios that compare between machines: a post to one
// observer and to a hundred, the remembered playlist and a query for it, the footer of a long
// playlist and a plain loop over the same sizes.

#include <iostream>
#include <numeric>

#include <benchmark/benchmark.h>

#include "doubles/HostDouble.h"
#include "runtime/objects/MainQueue.h"
#include "runtime/objects/NotificationCenter.h"
#include "settings/LMQuorlSettingsController.h"
#include "sync/LMSyncDefaults+Extras.h"
#include "tests/support/MainQueueRun.h"

namespace {

using quorl::HostDouble;
using quorl::SyncPreference;

constexpr NSNotificationName somethingHappened = "SomethingHappened";
constexpr std::uint64_t playlistCount = 1'000;
constexpr std::uint64_t chosen = playlistCount / 2;
constexpr std::size_t songCount = 100'000;
constexpr std::uint64_t songSize = 4'000'000;

HostDouble& host() { return dynamic_cast<HostDouble&>(quorl::Host::required()); }

/// Sync is on without a limit, the playlist in the middle of the library is chosen, and the
/// wearable keeps its replies back. Nobody takes notes.
std::shared_ptr<HostDouble> quietHost() {
    constexpr std::uint64_t noLimit = 2;
    auto host = std::make_shared<HostDouble>();
    for (std::uint64_t id = 1; id <= playlistCount; ++id) {
        host->mediaLibrary().addPlaylist(id, "Playlist");
    }
    host->mediaLibrary().setMediaTypes(MPMediaTypeMusic);
    (void)host->preferences.setValue(SyncPreference::AssetSyncEnabled, 1);
    (void)host->preferences.setValue(SyncPreference::AssetSyncPlaylistPersistentID, chosen);
    (void)host->preferences.setValue(SyncPreference::AssetSyncLimitType, noLimit);
    host->wearable.holdReplies();
    host->sizeTexts = HostDouble::SizeTexts::Platform;
    return host;
}

class Observer : public NSObject {
  public:
    void wasTold() { benchmark::DoNotOptimize(++count_); }

  private:
    std::uint64_t count_ = 0;
};

void postTo(benchmark::State& state, int observerCount) {
    const auto center = create<quorl::NotificationCenter>();
    std::vector<std::shared_ptr<Observer>> observers;
    for (int number = 0; number < observerCount; ++number) {
        observers.push_back(create<Observer>());
        center->addObserver_selector_name_object(
            observers.back().get(), NSNotificationSelector::of<&Observer::wasTold>("wasTold"),
            somethingHappened, nullptr);
    }
    for ([[maybe_unused]] auto turn : state) {
        center->postNotificationName_object(somethingHappened, nullptr);
    }
}

void rememberedPlaylist(benchmark::State& state) {
    for ([[maybe_unused]] auto turn : state) {
        benchmark::DoNotOptimize(assetSyncPlaylist(LMSyncDefaults::sharedDefaults()));
    }
}

void queriedPlaylist(benchmark::State& state) {
    for ([[maybe_unused]] auto turn : state) {
        const auto query = MPMediaQuery::playlistsQuery();
        query->addFilterPredicate(MPMediaPropertyPredicate::predicateWithValue_forProperty(
            NSNumber::numberWithUnsignedLongLong(chosen), MPMediaPlaylistPropertyPersistentID));
        benchmark::DoNotOptimize(query->collections());
    }
}

/// A reply of the wearable works the footer out anew and does nothing else.
void footerOfLongPlaylist(benchmark::State& state) {
    host().mediaLibrary().playlist(chosen)->setSongSizes(quorl::SongSizes(songCount, songSize));
    constexpr int refreshes = 50;
    const auto pane = create<LMQuorlSettingsController>();
    (void)pane->specifiers();
    for (int refresh = 0; refresh < refreshes; ++refresh) {
        pane->viewWillAppear(false); // asks the wearable, which has not replied yet
    }
    for ([[maybe_unused]] auto turn : state) {
        host().wearable.reply({1, 2});
        quorl::tests::runQueuedWork();
    }
}

void plainLoop(benchmark::State& state) {
    std::vector<std::uint64_t> sizes(songCount, songSize);
    for ([[maybe_unused]] auto turn : state) {
        benchmark::DoNotOptimize(sizes.data());
        benchmark::DoNotOptimize(std::accumulate(sizes.begin(), sizes.end(), std::uint64_t{0}));
    }
}

constexpr const char* postToOne = "post/1 observer";
constexpr const char* postToHundred = "post/100 observers";
constexpr const char* remembered = "playlist/remembered";
constexpr const char* queried = "playlist/query over 1,000";
constexpr const char* footer = "footer/100,000 songs";
constexpr const char* loop = "plain loop/100,000 sizes";

/// Prints the usual table, and below it the ratios.
class Reporter : public benchmark::ConsoleReporter {
  public:
    void ReportRuns(const std::vector<Run>& runs) override {
        ConsoleReporter::ReportRuns(runs);
        for (const Run& run : runs) {
            seconds_[run.run_name.function_name] =
                run.cpu_accumulated_time / static_cast<double>(run.iterations);
        }
    }

    void Finalize() override {
        ConsoleReporter::Finalize();
        printRatio(postToHundred, postToOne);
        printRatio(queried, remembered);
        printRatio(footer, loop);
    }

  private:
    void printRatio(const std::string& slower, const std::string& faster) {
        if (seconds_.contains(slower) && seconds_.contains(faster)) {
            std::cout << slower << " : " << faster << " = " << seconds_[slower] / seconds_[faster]
                      << '\n';
        }
    }

    std::map<std::string, double> seconds_;
};

} // namespace

int main(int argc, char** argv) {
    benchmark::Initialize(&argc, argv);
    (void)quorl::mainQueueDescriptor(); // before any thread is started
    quorl::Host::install(quietHost());
    benchmark::RegisterBenchmark(postToOne, postTo, 1);
    benchmark::RegisterBenchmark(postToHundred, postTo, 100);
    benchmark::RegisterBenchmark(remembered, rememberedPlaylist);
    benchmark::RegisterBenchmark(queried, queriedPlaylist);
    benchmark::RegisterBenchmark(footer, footerOfLongPlaylist)->Iterations(50);
    benchmark::RegisterBenchmark(loop, plainLoop);
    Reporter reporter;
    benchmark::RunSpecifiedBenchmarks(&reporter);
    return 0;
}
