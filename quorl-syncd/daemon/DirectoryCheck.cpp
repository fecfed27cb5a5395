#include "quorl-syncd/daemon/DirectoryCheck.h"

#include <cerrno>
#include <mutex>
#include <optional>
#include <system_error>

#include <fcntl.h>

#include "services/base/Errand.h"
#include "services/base/FileDescriptor.h"
#include "services/base/Utf8.h"

namespace quorl::syncd {

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

std::string quoted(const std::string& directory) { return "“" + base::printable(directory) + "”"; }

std::string silence(const std::string& directory) {
    return "What has " + quoted(directory) + " does not answer. Check its connection.";
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
        return quoted(directory) + " is not a directory. Name one.";
    default:
        return quoted(directory) + " cannot be read: " + std::generic_category().message(error) +
               ". Change that, or name another directory.";
    }
}

} // namespace

std::string DirectoryCheck::objectionTo(const std::string& directory) {
    if (directory.empty()) {
        return {}; // stands for the usual one
    }
    if (!directory.starts_with('/')) {
        return quoted(directory) + " is not a full path. Begin it with a slash.";
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
        return quoted(directory) + " cannot be looked at: " + error.code().message() +
               ". Close some programs, then try again.";
    }
    const auto objection = answer->get();
    if (!objection) {
        open_.push_back(answer);
    }
    return objection.value_or(silence(directory));
}

} // namespace quorl::syncd
