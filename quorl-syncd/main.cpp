// quorl-syncd: brings the chosen playlist to the wearable.

#include <array>
#include <csignal>
#include <functional>
#include <iostream>
#include <memory>

#include <CLI/CLI.hpp>
#include <glib.h>
#include <poll.h>
#include <sys/signalfd.h>
#include <unistd.h>

#include "quorl-syncd/bus/BusAnnouncer.h"
#include "quorl-syncd/bus/BusObjects.h"
#include "quorl-syncd/bus/DesktopNotices.h"
#include "quorl-syncd/bus/SleepInhibitor.h"
#include "quorl-syncd/bus/Watchers.h"
#include "quorl-syncd/daemon/ChosenWearable.h"
#include "quorl-syncd/daemon/DirectoryCheck.h"
#include "quorl-syncd/daemon/LocalMusic.h"
#include "quorl-syncd/daemon/LocalWearables.h"
#include "quorl-syncd/daemon/LoopTurns.h"
#include "quorl-syncd/daemon/SharedChoices.h"
#include "quorl-syncd/daemon/SyncThreads.h"
#include "quorl-syncd/engine/Engine.h"
#include "quorl-syncd/engine/LastResults.h"
#include "quorl-syncd/engine/NotReady.h"
#include "quorl-syncd/notices/NoticeAnnouncer.h"
#include "services/base/Errand.h"
#include "services/base/Utf8.h"
#include "services/engine/BusLoop.h"
#include "services/engine/Names.h"
#include "services/language/CommandLineWords.h"
#include "services/language/Languages.h"
#include "services/language/Translated.h"
#include "services/preferences/ChosenPlaces.h"
#include "services/preferences/SharedPreferences.h"

namespace {

using namespace quorl;
using language::filled;
using language::translated;
using language::wordedCheck;

enum ExitCode { Ended = 0, CannotStart = 1, BusLost = 2, AlreadyRunning = 3 };

int complain(ExitCode code, const std::string& problem) {
    std::cerr << "quorl-syncd: " << base::printable(problem) << '\n';
    return code;
}

/// Has the signals that end programs end the loop instead. Before any thread is started.
base::FileDescriptor blockSignals() {
    sigset_t signals;
    sigemptyset(&signals);
    sigaddset(&signals, SIGTERM);
    sigaddset(&signals, SIGINT);
    pthread_sigmask(SIG_BLOCK, &signals, nullptr);
    return base::FileDescriptor(signalfd(-1, &signals, SFD_CLOEXEC));
}

/// A relative path counts from where the daemon is started. Empty where the text is.
std::string fullPath(const std::string& path) {
    return path.empty() ? path : std::filesystem::absolute(path).string();
}

/// What the daemon is started with.
struct Options {
    base::Purpose purpose = base::Purpose::Use;
    syncd::EngineSettings engine;
    std::uint64_t embeddedCapacity = wearable::embeddedCapacity;
};

/// Ends the loop when the standard input ends: its other end is with the app.
void endWithInput(engine::BusLoop& loop) {
    loop.watch(STDIN_FILENO, POLLIN, [&loop] {
        std::array<char, 64> ignored{};
        if (read(STDIN_FILENO, ignored.data(), ignored.size()) <= 0) {
            loop.stop();
        }
    });
}

/// The settings that were not given on the command line are those that were chosen.
syncd::EngineSettings complete(syncd::EngineSettings settings,
                               const preferences::SharedPreferences& preferences) {
    if (settings.musicFolder.empty()) {
        settings.musicFolder = preferences::chosenMusicFolder(preferences);
    }
    if (settings.wearableDirectory.empty()) {
        settings.wearableDirectory = preferences::chosenWearable(preferences);
    }
    return settings;
}

/// Where another place cannot be taken, the engine goes on with the one that it has.
template <class Take>
void follow(Take take) {
    try {
        take();
    } catch (const syncd::NotReady& error) {
        std::cerr << "quorl-syncd: " << error.what() << '\n';
    }
}

void followPlaces(syncd::Engine& engine, syncd::ChosenWearable& wearable,
                  const preferences::SharedPreferences& preferences,
                  const preferences::KeySet& keys) {
    if (keys.contains(preferences::musicFolder.key)) {
        follow([&] { engine.setMusicFolder(preferences::chosenMusicFolder(preferences)); });
    }
    if (keys.contains(preferences::wearableDirectory.key) ||
        keys.contains(preferences::wearableIdentity.key)) {
        wearable.readAgain();
    }
}

void followWearable(syncd::Engine& engine, const std::string& directory) {
    const auto now = engine.wearable();
    if (directory != (now.isEmbedded ? "" : now.directory)) {
        follow([&] { engine.setWearableDirectory(directory); });
    } else {
        engine.refreshWearable();
    }
}

int serve(const Options& options) {
    const auto signals = blockSignals();
    engine::BusLoop loop(sdbus::createSessionBusConnection());
    loop.watch(signals.get(), POLLIN, [&] { loop.stop(); });
    const bool isTrial = options.purpose == base::Purpose::Trial;
    if (isTrial) {
        endWithInput(loop);
    }

    std::function<void(const preferences::KeySet&)> preferencesDidChange;
    auto opened = preferences::SharedPreferences::open(
        [&](const auto& /*preferences*/, const preferences::KeySet& keys) {
            loop.post([&, keys] { preferencesDidChange(keys); });
        },
        options.purpose);
    if (!opened.preferences) {
        return complain(CannotStart, opened.problem);
    }
    if (!opened.problem.empty()) {
        complain(CannotStart, opened.problem);
    }

    std::unique_ptr<syncd::BusObjects> objects;
    syncd::LoopTurns turns(loop);
    syncd::SharedChoices choices(*opened.preferences);
    syncd::LocalMusic music(loop);
    syncd::ChosenWearable wearable(loop, *opened.preferences, options.engine.wearableDirectory);
    syncd::LocalWearables wearables(loop, options.purpose, options.embeddedCapacity,
                                    wearable.objection());
    syncd::SyncThreads syncs(loop, [] { return std::make_shared<syncd::SleepInhibitor>(); });
    syncd::LastResults results(std::filesystem::path(g_get_user_state_dir()) / "quorl" /
                               (isTrial ? "trial" : ""));
    syncd::BusAnnouncer clients(loop.bus(), [&] {
        if (objects) {
            objects->publish();
        }
    });
    syncd::DesktopNotices notices(loop.bus());
    syncd::NoticeAnnouncer announcer(clients, turns, notices);
    const auto followWishForNotices = [&] {
        announcer.setWanted(!isTrial && opened.preferences->get(preferences::desktopNotices));
    };
    followWishForNotices();
    const syncd::EnginePorts ports{turns, choices, music, wearables, syncs, results, announcer};
    syncd::Engine engine(ports, complete(options.engine, *opened.preferences));
    announcer.follow([&]() -> const engine::EngineStatus& { return engine.status(); });
    preferencesDidChange = [&](const preferences::KeySet& keys) {
        followWishForNotices();
        followPlaces(engine, wearable, *opened.preferences, keys);
        if (keys != preferences::KeySet{preferences::desktopNotices.key}) {
            engine.choicesDidChange();
        }
    };
    wearable.watch([&](const std::string& directory) { followWearable(engine, directory); });
    syncd::DirectoryCheck check;
    const syncd::BusObjects::PlaceKeeper keeper{
        [&](const std::string& directory) { return check.objectionTo(directory); },
        [&](const std::string& folder) {
            return opened.preferences->set(preferences::musicFolder, folder).problem;
        },
        [&](const std::string& directory) { return wearable.remember(directory); }};
    syncd::Watchers watchers(loop.bus(), [&](syncd::Watchers::Presence presence) {
        announcer.setWatched(presence == syncd::Watchers::Presence::Somebody);
    });
    objects = std::make_unique<syncd::BusObjects>(loop.bus(), engine, keeper, watchers);
    try {
        loop.bus().requestName(engine::busNameFor(options.purpose));
    } catch (const sdbus::Error& error) {
        return complain(AlreadyRunning,
                        filled(translated("Another sync engine is running, which has the name "
                                          "{name}. End that one first. ({reason})"),
                               {{"name", engine::busNameFor(options.purpose)},
                                {"reason", error.getMessage()}}));
    }

    const auto problem = loop.run();
    return problem.empty()
               ? Ended
               : complain(BusLost, filled(translated("The session bus is gone ({reason}). Start "
                                                     "the engine again in the next session."),
                                          {{"reason", problem}}));
}

void addPlaces(CLI::App& program, Options& options) {
    program.add_flag_callback(
        "--trial", [&options] { options.purpose = base::Purpose::Trial; },
        translated("For a trial, beside another engine: settings and an embedded wearable of its "
                   "own; ends when its standard input ends"));
    program
        .add_option(
            "--music-folder", options.engine.musicFolder,
            translated("The folder with songs and playlists, instead of the one that was chosen"))
        ->type_name("DIRECTORY");
    program
        .add_option(
            "--wearable", options.engine.wearableDirectory,
            translated("The directory of a mounted wearable, instead of the one that was chosen"))
        ->type_name("DIRECTORY");
}

void addFigures(CLI::App& program, Options& options, std::int64_t& retryDelay) {
    const auto notNegative =
        wordedCheck(CLI::NonNegativeNumber, translated("give a number, 0 or more"));
    program
        .add_option("--embedded-capacity", options.embeddedCapacity,
                    translated("What the embedded wearable holds, in bytes"))
        ->type_name("BYTES")
        ->check(notNegative);
    program
        .add_option(
            "--rate-limit", options.engine.rateLimit,
            translated(
                "Bytes a second that are copied to the embedded wearable at most; 0 for no limit"))
        ->type_name("BYTES")
        ->check(notNegative);
    program
        .add_option(
            "--retry-after", retryDelay,
            filled(
                translated("Seconds after which a sync that did not work is tried again, twice as "
                           "many after each further one, up to an hour; {usual} unless given"),
                {{"usual", std::to_string(retryDelay)}}))
        ->type_name("SECONDS")
        ->check(wordedCheck(CLI::Range(1, 3600), translated("give a number from 1 to 3600")));
}

} // namespace

int main(int argc, char** argv) {
    language::followLanguages(language::usersLanguages());
    Options options;
    CLI::App program(translated("Brings the chosen playlist to the Velora, and tells on the "
                                "session bus how far it is."),
                     "quorl-syncd");
    language::wordCommandLine(program);
    program.set_version_flag("--version", "quorl-syncd " QUORL_VERSION,
                             translated("Print the version and end"));
    addPlaces(program, options);
    std::int64_t retryDelay = options.engine.retryDelay.count();
    addFigures(program, options, retryDelay);
    CLI11_PARSE(program, argc, argv);

    options.engine.retryDelay = std::chrono::seconds(retryDelay);
    options.engine.musicFolder = fullPath(options.engine.musicFolder);
    options.engine.wearableDirectory = fullPath(options.engine.wearableDirectory);

    try {
        return base::endOfProgram(serve(options));
    } catch (const sdbus::Error& error) {
        return complain(CannotStart,
                        filled(translated("There is no session bus ({reason}). Log in again, or "
                                          "start the program with dbus-run-session."),
                               {{"reason", error.getMessage()}}));
    } catch (const syncd::NotReady& error) {
        return complain(CannotStart, error.what());
    } catch (const std::exception& error) {
        return complain(CannotStart, filled(translated("The sync engine cannot go on: {reason}. "
                                                       "Close some programs, then start it again."),
                                            {{"reason", error.what()}}));
    }
}
