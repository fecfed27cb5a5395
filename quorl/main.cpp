#include <iostream>

#include "quorl/app/CommandLine.h"
#include "quorl/app/Run.h"
#include "quorl/reports/LibraryReport.h"
#include "quorl/reports/StatusReport.h"

namespace {

quorl::ExitCode run(char* program, const quorl::Options& options) {
    using Mode = quorl::Options::Mode;
    switch (options.mode) {
    case Mode::Window:
        return quorl::runInWindow(program, options);
    case Mode::Text:
        return quorl::runInTerminal(program, options);
    case Mode::Screenshot:
        return quorl::takeScreenshot(program, options);
    case Mode::Library:
        return quorl::printLibrary(options);
    case Mode::Status:
        return quorl::printStatus(options);
    }
    return quorl::ExitCode::Failure;
}

} // namespace

int main(int argc, char** argv) {
    const auto parsed = quorl::parseCommandLine(argc, argv);
    if (const auto* code = std::get_if<quorl::ExitCode>(&parsed)) {
        return static_cast<int>(*code);
    }
    try {
        return static_cast<int>(run(argv[0], std::get<quorl::Options>(parsed)));
    } catch (const std::exception& error) {
        std::cerr << "quorl: " << error.what() << ". Close some programs, then try again.\n";
        return static_cast<int>(quorl::ExitCode::Failure);
    }
}
