#include "tests/engine/calls/SystemCalls.h"

#include <algorithm>
#include <fstream>
#include <functional>
#include <map>
#include <optional>
#include <string_view>

namespace quorl::syncd::testing {

namespace {

/// All that change a file or a directory, or wait for the device; those that no volume uses too.
constexpr auto tracedCalls =
    "trace=open,openat,openat2,creat,mkdir,mkdirat,rmdir,unlink,unlinkat,rename,renameat,renameat2,"
    "link,linkat,symlink,symlinkat,mknod,mknodat,write,writev,pwrite64,pwritev,pwritev2,sendfile,"
    "copy_file_range,truncate,ftruncate,fallocate,utimensat,chmod,fchmod,fchmodat,chown,fchown,"
    "fchownat,setxattr,fsetxattr,ioctl,sync_file_range,fsync,fdatasync,syncfs,sync";

struct Call {
    std::string name;
    std::vector<std::string> arguments;
    std::string result;
};

/// Takes what is escaped in C's way for what it is.
std::string unescaped(std::string_view text) {
    constexpr std::string_view letters = "nrtfv";
    constexpr std::string_view meanings = "\n\r\t\f\v";
    constexpr std::size_t mostDigits = 3;
    constexpr int octal = 8;
    std::string result;
    for (std::size_t at = 0; at < text.size();) {
        if (text[at] != '\\' || at + 1 == text.size()) {
            result += text[at++];
            continue;
        }
        const auto digits = std::min(text.find_first_not_of("01234567", at + 1), text.size());
        const auto count = std::min(digits - at - 1, mostDigits);
        if (count > 0) {
            result += static_cast<char>(
                std::stoi(std::string(text.substr(at + 1, count)), nullptr, octal));
            at += 1 + count;
            continue;
        }
        const auto letter = letters.find(text[at + 1]);
        result += letter == std::string_view::npos ? text[at + 1] : meanings[letter];
        at += 2;
    }
    return result;
}

/// The place of the comma or bracket that ends the argument which begins at `at`.
std::size_t endOfArgument(std::string_view line, std::size_t at) {
    int depth = 0;
    bool isQuoted = false;
    for (; at < line.size(); ++at) {
        const char letter = line[at];
        if (letter == '\\') {
            ++at;
        } else if (letter == '"') {
            isQuoted = !isQuoted;
        } else if (!isQuoted && (letter == '[' || letter == '{' || letter == '<')) {
            ++depth;
        } else if (!isQuoted && (letter == ']' || letter == '}' || letter == '>')) {
            --depth;
        } else if (!isQuoted && depth == 0 && (letter == ',' || letter == ')')) {
            return at;
        }
    }
    return at;
}

/// Nothing where the line tells of something else, such as a signal.
std::optional<Call> parse(std::string_view line) {
    const auto begin = std::min(line.find(' '), line.size() - 1) + 1;
    const auto bracket = line.find('(');
    if (bracket == std::string_view::npos || line.substr(begin).starts_with("---")) {
        return std::nullopt;
    }
    Call call{std::string(line.substr(begin, bracket - begin)), {}, {}};
    for (auto at = bracket + 1, end = at; end < line.size() && line[end] != ')'; at = end + 2) {
        end = endOfArgument(line, at);
        call.arguments.emplace_back(line.substr(at, end - at));
    }
    const auto equals = line.rfind(" = ");
    call.result = equals == std::string_view::npos ? "" : line.substr(equals + 3);
    return call;
}

std::string quoted(const std::string& argument) {
    const auto begin = argument.find('"') + 1;
    return unescaped(std::string_view(argument).substr(begin, argument.rfind('"') - begin));
}

/// Of a descriptor, which strace gives as 3</a/path>.
std::string pathOf(const std::string& argument) {
    const auto begin = argument.find('<') + 1;
    return unescaped(std::string_view(argument).substr(begin, argument.rfind('>') - begin));
}

bool isDescriptor(const std::string& argument) { return argument.ends_with('>'); }

/// Translates calls to steps.
class Translator {
  public:
    explicit Translator(std::filesystem::path wearable) : wearable_(std::move(wearable)) {}

    [[nodiscard]] std::optional<Step> stepOf(const Call& call) const {
        const auto file = inWearable(target(call));
        if (!file || call.result.starts_with('-') || call.result.starts_with('?')) {
            return std::nullopt;
        }
        return named(call, *file);
    }

  private:
    [[nodiscard]] static std::filesystem::path target(const Call& call) {
        const auto& arguments = call.arguments;
        if (arguments.empty()) {
            return {};
        }
        if (!isDescriptor(arguments[0])) {
            return arguments[0].starts_with('"') ? quoted(arguments[0]) : "";
        }
        const bool hasName = call.name.ends_with("at") || call.name.ends_with("at2");
        const bool isInDirectory = hasName && arguments.size() > 1 && arguments[1].starts_with('"');
        return isInDirectory ? pathOf(arguments[0]) / std::filesystem::path(quoted(arguments[1]))
                             : std::filesystem::path(pathOf(arguments[0]));
    }

    /// As a step says it; nothing where it is elsewhere.
    [[nodiscard]] std::optional<std::string> inWearable(const std::filesystem::path& path) const {
        const auto relative = path.lexically_relative(wearable_);
        if (relative.empty() || relative.native().starts_with("..")) {
            return std::nullopt;
        }
        const auto text = relative.lexically_normal().native();
        const bool isDirectory = text == "Music" || text == ".quorl";
        return text == "." ? "/" : isDirectory ? text + "/" : text;
    }

    [[nodiscard]] static std::optional<Step> named(const Call& call, const std::string& file) {
        static const std::map<std::string, std::string> names{
            {"mkdirat", "make"},   {"unlinkat", "remove"}, {"fsync", "fsync"},
            {"utimensat", "time"}, {"write", "write"},     {"sync_file_range", "flush"}};
        if (call.name == "syncfs") {
            return Step{"sync", "", ""};
        }
        if (call.name == "openat") {
            return opened(call.arguments.at(2), file);
        }
        if (call.name == "renameat2" && call.arguments.back() == "RENAME_NOREPLACE") {
            return Step{"rename", file, quoted(call.arguments.at(3))};
        }
        const auto name = names.find(call.name);
        return Step{name == names.end() ? call.name : name->second, file,
                    call.name == "write" ? quoted(call.arguments.at(1)) : ""};
    }

    [[nodiscard]] static std::optional<Step> opened(const std::string& how,
                                                    const std::string& file) {
        const auto says = [&](const char* flag) { return how.find(flag) != std::string::npos; };
        if (says("O_CREAT") && says("O_EXCL")) {
            return Step{"create", file, ""};
        }
        if (says("O_CREAT") || says("O_TRUNC")) {
            return Step{"openat", file, how};
        }
        return says("O_WRONLY") ? std::optional(Step{"overwrite", file, ""}) : std::nullopt;
    }

    const std::filesystem::path wearable_;
};

} // namespace

std::vector<std::string> tracer(const std::filesystem::path& log) {
    return {STRACE,
            "--follow-forks",
            "--output-separately",
            "--absolute-timestamps=format:unix,precision:ns",
            "--decode-fds=path",
            "--string-limit=10000000",
            "--quiet=all",
            "--interruptible=waiting",
            "-e",
            tracedCalls,
            "--output=" + log.native()};
}

std::vector<std::string> linesOf(const std::filesystem::path& log) {
    std::vector<std::string> lines;
    for (const auto& file : std::filesystem::directory_iterator(log.parent_path())) {
        if (file.path().stem() == log.filename()) {
            std::ifstream stream(file.path());
            for (std::string line; std::getline(stream, line);) {
                lines.push_back(line);
            }
        }
    }
    std::ranges::sort(lines); // each begins with its time
    return lines;
}

Steps stepsIn(const std::vector<std::string>& lines, const std::filesystem::path& wearable) {
    const Translator translator(wearable);
    Steps steps;
    for (const auto& line : lines) {
        const auto call = parse(line);
        const auto step = call ? translator.stepOf(*call) : std::nullopt;
        if (step) {
            steps.push_back(*step);
        }
    }
    return steps;
}

} // namespace quorl::syncd::testing
