#include "quorl-syncd/daemon/DirectoryCheck.h"

#include <cerrno>
#include <mutex>
#include <optional>
#include <system_error>

#include <fcntl.h>

#include "services/base/Errand.h"
#include "services/base/FileDescriptor.h"
#include "services/base/Utf8.h"
#include "services/language/Translated.h"

namespace quorl::syncd {

using language::translated;

/// Shared with the thread that asks for it.
struct DirectoryCheck::Answer {
    explicit Answer(std::string asked) : directory(std::move(asked)) {}

    void give(std::string text) {
        const std::scoped_lock lock(mutex);
        objection = std::move(text);
    }

    [[nodiscard]] std::optional<std::string> get() const {
        const std::scoped_lock lock(mutex);
        return objection;
    }

    const std::string directory;
    mutable std::mutex mutex;
    /// Nothing as long as it is not known.
    std::optional<std::string> objection;
};

namespace {

constexpr std::chrono::seconds patience{1};
constexpr std::size_t mostOpen = 4;

/// @param pattern a sentence about it, translated.
/// @param error what the system says.
std::string complaint(const std::string& pattern, const std::string& directory, int error = 0) {
    return language::filled(pattern, {{"name", base::printable(directory)},
                                      {"reason", std::generic_category().message(error)}});
}

std::string silence(const std::string& directory) {
    return complaint(translated("What has “{name}” does not answer. Check its connection."),
                     directory);
}

/// Never waits for a pipe, which is no directory.
std::string examined(const std::string& directory) {
    const base::FileDescriptor opened(
        ::open(directory.c_str(), O_RDONLY | O_DIRECTORY | O_NONBLOCK | O_CLOEXEC));
    const int error = opened ? 0 : errno;
    switch (error) {
    case 0:
    case ENOENT:
        return {};
    case ENOTDIR:
        return complaint(translated("“{name}” is not a directory. Name one."), directory);
    default:
        return complaint(
            translated(
                "“{name}” cannot be read: {reason}. Change that, or name another directory."),
            directory, error);
    }
}

} // namespace

std::string DirectoryCheck::objectionTo(const std::string& directory) {
    if (directory.empty()) {
        return {}; // stands for the usual one
    }
    if (!directory.starts_with('/')) {
        return complaint(translated("“{name}” is not a full path. Begin it with a slash."),
                         directory);
    }
    std::erase_if(open_, [](const auto& answer) { return answer->get().has_value(); });
    if (open_.size() >= mostOpen) {
        return silence(open_.front()->directory);
    }
    const auto answer = std::make_shared<Answer>(directory);
    try {
        // Its end waits for the answer.
        const base::Errand errand(
            [answer](const std::stop_token&) { answer->give(examined(answer->directory)); },
            patience);
    } catch (const std::system_error& error) {
        return complaint(
            translated(
                "“{name}” cannot be looked at: {reason}. Close some programs, then try again."),
            directory, error.code().value());
    }
    const auto objection = answer->get();
    if (!objection) {
        open_.push_back(answer);
    }
    return objection.value_or(silence(directory));
}

} // namespace quorl::syncd
