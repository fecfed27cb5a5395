#include "quorl/app/CommandLine.h"

#include <charconv>
#include <iostream>
#include <map>
#include <optional>

#include <CLI/CLI.hpp>

namespace quorl {

namespace {

constexpr const char* exitCodes = "Exit codes:\n"
                                  "  0  done\n"
                                  "  1  it could not be done; standard error says why\n"
                                  "  2  the command line is wrong\n"
                                  "  3  --library: the music folder is missing";

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
        return "give the size as WIDTHxHEIGHT, each from " + std::to_string(smallestSide) + " to " +
               std::to_string(largestSide) + ", for instance 360x720";
    }
    picture.width = *width;
    picture.height = *height;
    return {};
}

void addModes(CLI::App& app, Options& options, bool& text, bool& library, bool& status) {
    auto* textFlag =
        app.add_flag("--text", text, "Show the pane in the terminal, without any display");
    auto* screenshot = app.add_option("--screenshot", options.picture.file,
                                      "Write a picture of the pane to FILE (PNG) and end")
                           ->type_name("FILE");
    auto* libraryFlag = app.add_flag(
        "--library", library, "Print what the music folder holds and what was left out, and end");
    auto* statusFlag =
        app.add_flag("--status", status, "Print how the sync and the wearable stand, and end");
    app.add_flag("--json", options.json, "Print the status as JSON")->needs(statusFlag);
    textFlag->excludes(screenshot)->excludes(libraryFlag)->excludes(statusFlag);
    screenshot->excludes(libraryFlag)->excludes(statusFlag);
    libraryFlag->excludes(statusFlag);
}

void addPlaces(CLI::App& app, Places& places) {
    app.add_option(
           "--music", places.music,
           "For a trial with this music folder: with a sync engine and settings of its own, "
           "so that nothing of what is chosen changes")
        ->type_name("DIR");
    app.add_option("--wearable", places.wearable,
                   "For a trial with the Velora that is mounted in this directory")
        ->type_name("DIR");
    app.add_option("--plugins", places.plugins, "Look for plug-ins here before all other places")
        ->type_name("DIR")
        ->check(CLI::ExistingDirectory);
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
           "Size of the picture in points (default 360x720)")
        ->type_name("WxH")
        ->needs(screenshot);
    app.add_option("--scale", picture.scale, "Pixels of the picture to the point (default 1)")
        ->type_name("N")
        ->check(CLI::Range(1.0, 4.0))
        ->needs(screenshot);
    app.add_flag("--dark", picture.isDark, "Picture the dark look")->needs(screenshot);
    static const std::map<std::string, Picture::Pane> panes{{"root", Picture::Pane::Root},
                                                            {"playlist", Picture::Pane::Playlist},
                                                            {"limit", Picture::Pane::Limit},
                                                            {"front", Picture::Pane::Front}};
    app.add_option_function<std::string>(
           "--pane", [&picture](const std::string& name) { picture.pane = panes.at(name); },
           "Picture this pane (default root)")
        ->type_name("root|playlist|limit|front")
        ->check(CLI::IsMember(panes).description(""))
        ->needs(screenshot);
}

void chooseMode(Options& options, bool text, bool library, bool status) {
    if (text) {
        options.mode = Options::Mode::Text;
    } else if (library) {
        options.mode = Options::Mode::Library;
    } else if (status) {
        options.mode = Options::Mode::Status;
    } else if (!options.picture.file.empty()) {
        options.mode = Options::Mode::Screenshot;
    }
}

void complete(Places& places) {
    for (auto* place : {&places.music, &places.wearable}) {
        if (!place->empty()) {
            *place = absolute(*place).lexically_normal();
        }
    }
}

} // namespace

std::variant<Options, ExitCode> parseCommandLine(int argc, const char* const* argv) {
    Options options;
    bool text = false;
    bool library = false;
    bool status = false;
    CLI::App app("Chooses the music that goes to your Velora.", "quorl");
    app.set_version_flag("--version", "quorl " QUORL_VERSION, "Print the version and end");
    app.set_help_flag("-h,--help", "Print this help and end");
    app.footer(exitCodes);
    addModes(app, options, text, library, status);
    addPlaces(app, options.places);
    addPictureOptions(app, options.picture);
    try {
        app.parse(argc, argv);
    } catch (const CLI::ParseError& error) {
        if (error.get_exit_code() == static_cast<int>(CLI::ExitCodes::Success)) {
            app.exit(error); // help or version
            return ExitCode::Success;
        }
        std::cerr << "quorl: " << error.what() << "\nRun \"quorl --help\" for the options.\n";
        return ExitCode::Usage;
    }
    chooseMode(options, text, library, status);
    complete(options.places);
    return options;
}

} // namespace quorl
