#include "quorl/app/CommandLine.h"

#include <algorithm>
#include <charconv>
#include <map>
#include <optional>
#include <vector>

#include <CLI/CLI.hpp>

#include "services/base/Utf8.h"
#include "services/language/CommandLineWords.h"
#include "services/language/Translated.h"
#include "services/preferences/Preference.h"

namespace quorl {

using language::filled;
using language::translated;
using language::wordedCheck;

namespace {

constexpr auto exitCodes =
    language::toTranslate("Exit codes:\n"
                          "  0  done\n"
                          "  1  it could not be done; standard error says why\n"
                          "  2  the command line is wrong\n"
                          "  3  --library, --playlists: the music folder is missing");

/// So that megabytes are still a number of bytes.
constexpr std::uint64_t mostOfALimit = std::uint64_t{1} << 40U;

constexpr int smallestSide = 200;
constexpr int largestSide = 8192;

std::optional<int> side(std::string_view digits) {
    int value = 0;
    const char* end = digits.data() + digits.size();
    const auto parsed = std::from_chars(digits.data(), end, value);
    const bool isSide = parsed.ec == std::errc() && parsed.ptr == end && value >= smallestSide &&
                        value <= largestSide;
    return isSide ? std::optional(value) : std::nullopt;
}

/// Takes "360x720"; gives what is wrong back, empty for nothing.
std::string takeSize(const std::string& text, Picture& picture) {
    const auto separator = text.find('x');
    const auto width = side(std::string_view(text).substr(0, separator));
    const auto height = separator == std::string::npos
                            ? std::nullopt
                            : side(std::string_view(text).substr(separator + 1));
    if (!width || !height) {
        return filled(
            translated(
                "give the size as WIDTHxHEIGHT, each from {least} to {most}, for instance 360x720"),
            {{"least", std::to_string(smallestSide)}, {"most", std::to_string(largestSide)}});
    }
    picture.width = *width;
    picture.height = *height;
    return {};
}

/// Which of the modes were given.
struct Flags {
    bool text = false;
    bool library = false;
    bool playlists = false;
    bool wearables = false;
    bool status = false;
};

void excludeEachOther(const std::vector<CLI::Option*>& options) {
    for (auto one = options.begin(); one != options.end(); ++one) {
        std::for_each(std::next(one), options.end(),
                      [one](CLI::Option* other) { (*one)->excludes(other); });
    }
}

void addModes(CLI::App& app, Options& options, Flags& flags) {
    auto* text = app.add_flag("--text", flags.text,
                              translated("Show the pane in the terminal, without any display"));
    auto* screenshot =
        app.add_option("--screenshot", options.picture.file,
                       translated("Write a picture of the pane to FILE (PNG) and end"))
            ->type_name("FILE");
    auto* library = app.add_flag(
        "--library", flags.library,
        translated("Print what the music folder holds and what was left out, and end"));
    auto* playlists =
        app.add_flag("--playlists", flags.playlists,
                     translated("Print the playlists that can be chosen, one a line: id, songs, "
                                "bytes, name, separated by tabs; and end"));
    auto* wearables = app.add_flag(
        "--wearables", flags.wearables,
        translated(
            "Print the wearables that can be chosen, one a line: * for the one that is chosen, "
            "bytes free, bytes in all, name, directory, separated by tabs; and end"));
    auto* status = app.add_flag("--status", flags.status,
                                translated("Print how the sync and the wearable stand, and end"));
    excludeEachOther({text, screenshot, library, playlists, wearables, status});
    app.add_flag("--json", options.json, translated("Print the status or a list as JSON"));
}

constexpr auto usualMusic = "usual";

std::filesystem::path full(const std::filesystem::path& path) {
    return absolute(path).lexically_normal();
}

/// What a unit of a limit counts; nothing where it is none.
std::optional<std::uint64_t> limitTypeOf(const std::string& unit) {
    static const std::map<std::string, std::uint64_t> types{
        {"song", preferences::LimitType::Songs},
        {"songs", preferences::LimitType::Songs},
        {"mb", preferences::LimitType::Megabytes}};
    const auto found = types.find(CLI::detail::to_lower(unit));
    return found == types.end() ? std::nullopt : std::optional(found->second);
}

/// Takes "50 songs" or "500 MB"; gives what is wrong back, empty for nothing.
std::string takeLimit(const std::string& text, Commands& commands) {
    LimitChoice limit;
    const char* end = text.data() + text.size();
    const auto parsed = std::from_chars(text.data(), end, limit.amount);
    const auto type = limitTypeOf(CLI::detail::trim_copy(std::string(parsed.ptr, end)));
    if (parsed.ec != std::errc() || limit.amount == 0 || limit.amount > mostOfALimit || !type) {
        return translated("give the limit as a number of songs or megabytes, for instance \"50 "
                          "songs\" or \"500 MB\"");
    }
    limit.type = *type;
    commands.limit = limit;
    return {};
}

void addCommands(CLI::App& app, Commands& commands) {
    std::vector<CLI::Option*> all{
        app.add_option("--use-wearable", commands.wearable,
                       translated("Choose this wearable for good, by its name, the path of its "
                                  "directory, or \"this-device\" for the one in this machine"))
            ->type_name("WEARABLE"),
        app.add_option_function<std::string>(
               "--use-music",
               [&commands](const std::string& folder) {
                   if (folder.empty()) {
                       throw CLI::ValidationError("--use-music", translated("name a folder"));
                   }
                   commands.music = folder == usualMusic ? std::string() : full(folder).string();
               },
               translated("Choose this music folder for good, or \"usual\" for the user's own"))
            ->type_name("DIR"),
        app.add_option("--choose", commands.playlist,
                       translated("Choose this playlist, by its name or its id, or \"none\""))
            ->type_name("PLAYLIST"),
        app.add_option_function<std::string>(
               "--limit",
               [&commands](const std::string& limit) {
                   if (const auto problem = takeLimit(limit, commands); !problem.empty()) {
                       throw CLI::ValidationError("--limit", problem);
                   }
               },
               translated("Choose how much of it is synced at most: \"50 songs\", \"500 MB\""))
            ->type_name("LIMIT"),
        app.add_flag(
            "--sync", commands.sync,
            translated("Sync now, also off the charger and when everything was sent already")),
        app.add_flag("--cancel", commands.cancel, translated("End the running sync")),
        app.add_flag("--wait", commands.wait,
                     translated("End when everything is on the wearable, or it is clear that it "
                                "does not get there")),
    };
    app.get_option("--sync")->excludes(app.get_option("--cancel"));
    for (auto* command : all) {
        for (const auto* other : {"--text", "--screenshot", "--library", "--playlists",
                                  "--wearables", "--status", "--json", "--music", "--wearable"}) {
            command->excludes(app.get_option(other));
        }
    }
}

void addPlaces(CLI::App& app, Places& places) {
    app.add_option(
           "--music", places.music,
           translated("For this run only, a trial with this music folder: with a sync engine and "
                      "settings of its own, so that nothing of what is chosen changes"))
        ->type_name("DIR");
    app.add_option(
           "--wearable", places.wearable,
           translated(
               "For this run only, a trial with the Velora that is mounted in this directory"))
        ->type_name("DIR");
    app.add_option("--plugins", places.plugins,
                   translated("Look for plug-ins here before all other places"))
        ->type_name("DIR")
        ->check(wordedCheck(CLI::ExistingDirectory, translated("name a directory that is there")));
}

void addPictureOptions(CLI::App& app, Picture& picture) {
    auto* screenshot = app.get_option("--screenshot");
    app.add_option_function<std::string>(
           "--size",
           [&picture](const std::string& size) {
               if (const auto problem = takeSize(size, picture); !problem.empty()) {
                   throw CLI::ValidationError("--size", problem);
               }
           },
           translated("Size of the picture in points (default 360x720)"))
        ->type_name("WxH")
        ->needs(screenshot);
    app.add_option("--scale", picture.scale,
                   translated("Pixels of the picture to the point (default 1)"))
        ->type_name("N")
        ->check(wordedCheck(CLI::Range(1.0, 4.0), translated("give a number from 1 to 4")))
        ->needs(screenshot);
    app.add_flag("--dark", picture.isDark, translated("Picture the dark look"))->needs(screenshot);
    static const std::map<std::string, Picture::Pane> panes{{"root", Picture::Pane::Root},
                                                            {"playlist", Picture::Pane::Playlist},
                                                            {"limit", Picture::Pane::Limit},
                                                            {"front", Picture::Pane::Front}};
    app.add_option_function<std::string>(
           "--pane", [&picture](const std::string& name) { picture.pane = panes.at(name); },
           translated("Picture this pane (default root)"))
        ->type_name("root|playlist|limit|front")
        ->check(wordedCheck(CLI::IsMember(panes),
                            translated("give one of root, playlist, limit and front")))
        ->needs(screenshot);
}

Options::Mode modeOf(const Options& options, const Flags& flags) {
    const auto& commands = options.commands;
    const bool isCommanded = commands.wearable || commands.music || commands.playlist ||
                             commands.limit || commands.sync || commands.cancel || commands.wait;
    return flags.text                      ? Options::Mode::Text
           : flags.library                 ? Options::Mode::Library
           : flags.playlists               ? Options::Mode::Playlists
           : flags.wearables               ? Options::Mode::Wearables
           : flags.status                  ? Options::Mode::Status
           : isCommanded                   ? Options::Mode::Commands
           : !options.picture.file.empty() ? Options::Mode::Screenshot
                                           : Options::Mode::Window;
}

void complete(Places& places) {
    for (auto* place : {&places.music, &places.wearable, &places.plugins}) {
        if (!place->empty()) {
            *place = full(*place);
        }
    }
}

/// A trial keeps its places in settings, which are texts. What only reads takes any path.
void requireStorable(const Options& options) {
    const bool isKept = options.mode == Options::Mode::Window ||
                        options.mode == Options::Mode::Text ||
                        options.mode == Options::Mode::Screenshot;
    const auto& commands = options.commands;
    std::vector<std::string> kept{commands.music.value_or(""), commands.wearable.value_or("")};
    if (isKept) {
        kept.insert(kept.end(), {options.places.music.string(), options.places.wearable.string()});
    }
    for (const auto& place : kept) {
        if (base::validUtf8(place) != place) {
            throw CLI::ValidationError(
                base::printable(place),
                translated("the name of this folder is not in UTF-8, rename it"));
        }
    }
}

} // namespace

std::variant<Options, ExitCode> parseCommandLine(int argc, const char* const* argv) {
    Options options;
    Flags flags;
    CLI::App app(translated("Chooses the music that goes to your Velora."), "quorl");
    language::wordCommandLine(app);
    app.set_version_flag("--version", "quorl " QUORL_VERSION,
                         translated("Print the version and end"));
    app.footer(translated(exitCodes));
    addModes(app, options, flags);
    addPlaces(app, options.places);
    addCommands(app, options.commands);
    addPictureOptions(app, options.picture);
    try {
        app.parse(argc, argv);
        if (options.json && !flags.status && !flags.playlists && !flags.wearables) {
            throw CLI::ValidationError(
                "--json", translated("give --status, --playlists or --wearables with it"));
        }
        options.mode = modeOf(options, flags);
        complete(options.places);
        requireStorable(options);
    } catch (const CLI::ParseError& error) {
        // Help and version are answered in the same way as mistakes.
        const bool isMistake = app.exit(error) != static_cast<int>(CLI::ExitCodes::Success);
        return isMistake ? ExitCode::Usage : ExitCode::Success;
    }
    return options;
}

} // namespace quorl
