#include <cerrno>
#include <csignal>
#include <cstdio>
#include <iostream>
#include <system_error>

#include <CLI/CLI.hpp>
#include <fcntl.h>
#include <unistd.h>

#include "quorl-script/Interpreter.h"
#include "quorl-script/TraceRecorder.h"
#include "quorl-script/input/LineReader.h"

namespace {

using namespace quorl;

enum ExitCode { Success = 0, Failed = 1, Unusable = 2 };

constexpr const char* footer = "Reads one command, a JSON object, from each line and writes one "
                               "reply to each.\n\n"
                               "Exit codes:\n"
                               "  0  every command was carried out\n"
                               "  1  a command was not; its reply says why\n"
                               "  2  the command line is wrong, a script cannot be read, or the "
                               "plug-in cannot be loaded";

struct Options {
    std::vector<std::string> scripts;
    std::string plugins;
};

/// An opened script, closed with this object unless it is standard input.
class Script {
  public:
    explicit Script(const std::string& name)
        : name_(name), descriptor_(name == "-" ? STDIN_FILENO : open(name.c_str(), flags)) {
        if (descriptor_ < 0) {
            throw std::system_error(errno, std::generic_category(), name);
        }
    }

    Script(Script&& other) noexcept
        : name_(std::move(other.name_)), descriptor_(std::exchange(other.descriptor_, -1)) {}

    Script& operator=(Script&&) = delete;

    ~Script() {
        if (descriptor_ > STDIN_FILENO) {
            close(descriptor_);
        }
    }

    [[nodiscard]] const std::string& name() const { return name_; }

    [[nodiscard]] int descriptor() const { return descriptor_; }

  private:
    static constexpr int flags = O_RDONLY | O_CLOEXEC;

    std::string name_;
    int descriptor_;
};

/// Writes a line as a whole before the next command is looked at.
void writeLine(std::string line) {
    line += '\n';
    for (std::size_t written = 0; written < line.size();) {
        const ssize_t length = write(STDOUT_FILENO, line.data() + written, line.size() - written);
        if (length >= 0) {
            written += static_cast<std::size_t>(length);
        } else if (errno != EINTR) {
            throw std::system_error(errno, std::generic_category(), "standard output");
        }
    }
}

void play(Interpreter& interpreter, const Script& script) {
    LineReader reader(script.descriptor());
    std::string line;
    for (auto result = reader.next(line); result != LineReader::Result::End;
         result = reader.next(line)) {
        writeLine(result == LineReader::Result::Line
                      ? interpreter.reply(line)
                      : interpreter.replyToTooLongLine(LineReader::limit));
    }
}

ExitCode run(const Options& options) {
    std::vector<Script> scripts;
    for (const std::string& name : options.scripts) {
        scripts.emplace_back(name);
    }
    const auto trace = std::make_shared<Trace>();
    const auto host = std::make_shared<HostDouble>(std::make_shared<TraceRecorder>(trace));
    Host::install(host);
    const Plugin plugin = Plugin::load(pluginDirectories(options.plugins));
    Interpreter interpreter(*host, trace, plugin);
    for (const Script& script : scripts) {
        play(interpreter, script);
    }
    return interpreter.hasFailed() ? Failed : Success;
}

} // namespace

int main(int argc, char** argv) {
    Options options;
    CLI::App app("Plays a script against the Music pane.", "quorl-script");
    app.set_version_flag("--version", "quorl-script " QUORL_VERSION, "Print the version and end");
    app.set_help_flag("-h,--help", "Print this help and end");
    app.footer(footer);
    app.add_option("script", options.scripts, "Scripts, one after the other; - is standard input")
        ->type_name("FILE")
        ->default_val(std::vector<std::string>{"-"})
        ->default_str("-");
    app.add_option("--plugins", options.plugins, "Look for plug-ins here before all other places")
        ->type_name("DIR")
        ->check(CLI::ExistingDirectory);
    try {
        app.parse(argc, argv);
    } catch (const CLI::ParseError& error) {
        if (error.get_exit_code() == static_cast<int>(CLI::ExitCodes::Success)) {
            return app.exit(error); // help or version
        }
        std::cerr << "quorl-script: " << error.what()
                  << "\nRun \"quorl-script --help\" for the options.\n";
        return Unusable;
    }
    std::signal(SIGPIPE, SIG_IGN); // who reads may leave: an error of writing then
    try {
        return run(options);
    } catch (const std::exception& error) {
        std::cerr << "quorl-script: " << error.what() << '\n';
        return Unusable;
    }
}
