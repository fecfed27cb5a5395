#include <iostream>

#include "quorl/app/CommandLine.h"
#include "quorl/commands/PlaylistList.h"
#include "quorl/commands/RunCommands.h"
#include "quorl/commands/WearableList.h"
#include "quorl/reports/LibraryReport.h"
#include "quorl/reports/Screenshot.h"
#include "quorl/reports/StatusReport.h"
#include "quorl/terminal/TerminalMode.h"
#include "quorl/window/WindowMode.h"
#include "services/base/Errand.h"
#include "services/language/Languages.h"
#include "services/language/Translated.h"

namespace quorl {

namespace {

ExitCode run(char* program, const Options& options) {
    switch (options.mode) {
    case Options::Mode::Window:
        return runInWindow(program, options.places);
    case Options::Mode::Text:
        return runInTerminal(program, options.places);
    case Options::Mode::Screenshot:
        return takeScreenshot(program, options.places, options.picture);
    case Options::Mode::Library:
        return printLibrary(options.places.music);
    case Options::Mode::Playlists:
        return printPlaylists(options);
    case Options::Mode::Wearables:
        return printWearables(options);
    case Options::Mode::Commands:
        return runCommands(options.commands);
    case Options::Mode::Status:
        return printStatus(options);
    }
    return ExitCode::Failure;
}

} // namespace

} // namespace quorl

int main(int argc, char** argv) {
    namespace language = quorl::language;
    language::followLanguages(language::usersLanguages());
    const auto parsed = quorl::parseCommandLine(argc, argv);
    if (const auto* code = std::get_if<quorl::ExitCode>(&parsed)) {
        return static_cast<int>(*code);
    }
    try {
        const auto code = quorl::run(argv[0], std::get<quorl::Options>(parsed));
        return quorl::base::endOfProgram(static_cast<int>(code));
    } catch (const std::exception& error) {
        const auto pattern = language::translated("{reason}. Close some programs, then try again.");
        std::cerr << "quorl: " << language::filled(pattern, {{"reason", error.what()}}) << '\n';
        return static_cast<int>(quorl::ExitCode::Failure);
    }
}
