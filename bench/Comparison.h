#pragma once

#include <algorithm>
#include <chrono>
#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

#include <sys/resource.h>

/// What benches compare and tell: ratios of what was done in turns in one run, so that they do not
/// depend on the machine.
namespace quorl::bench {

using Clock = std::chrono::steady_clock;
using Seconds = std::chrono::duration<double>;

[[nodiscard]] inline Seconds timeOf(const std::function<void()>& act) {
    const Clock::time_point begin = Clock::now();
    act();
    return Clock::now() - begin;
}

/// That of this process, or of its children that have ended.
[[nodiscard]] inline Seconds processorTime(int whose = RUSAGE_SELF) {
    rusage usage{};
    getrusage(whose, &usage);
    const auto seconds = [](const timeval& time) {
        return Seconds(static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_usec) / 1e6);
    };
    return seconds(usage.ru_utime) + seconds(usage.ru_stime);
}

/// @param values at least one.
/// @param part 0.5 for the median.
[[nodiscard]] inline double quantile(std::vector<double> values, double part) {
    std::ranges::sort(values);
    return values[static_cast<std::size_t>(part * static_cast<double>(values.size() - 1))];
}

/// Runs a command of the shell. Throws `std::runtime_error` where that fails.
inline void run(const std::string& command) {
    // NOLINTNEXTLINE(concurrency-mt-unsafe): nobody changes the handling of signals here
    if (std::system(command.c_str()) != 0) {
        throw std::runtime_error("failed: " + command);
    }
}

/// Two ways to do the same, of which each round has one after the other: they meet the same state
/// of the machine.
class Comparison {
  public:
    void add(Seconds ours, Seconds theirs) {
        ours_.push_back(ours.count());
        theirs_.push_back(theirs.count());
        ratios_.push_back(ours / theirs);
    }

    /// A line of JSON: medians, and the ratios of the quarter of the rounds that did best and of
    /// the quarter that did worst.
    void print(const std::string& what, const std::string& beside) const {
        std::printf(R"({"what":"%s","beside":"%s","ratio":%.3f,"spread":[%.3f,%.3f],"rounds":%zu,)"
                    R"("seconds":[%.4f,%.4f]})"
                    "\n",
                    what.c_str(), beside.c_str(), quantile(ratios_, 0.5), quantile(ratios_, 0.25),
                    quantile(ratios_, 0.75), ratios_.size(), quantile(ours_, 0.5),
                    quantile(theirs_, 0.5));
        std::fflush(stdout);
    }

  private:
    std::vector<double> ours_;
    std::vector<double> theirs_;
    std::vector<double> ratios_;
};

/// A directory that is gone when it is no longer needed.
class Temporary {
  public:
    /// @param name is followed by random letters.
    explicit Temporary(const std::string& name)
        : path_(std::filesystem::temp_directory_path() / (name + "-XXXXXX")) {
        if (mkdtemp(path_.data()) == nullptr) {
            throw std::runtime_error("No temporary directory can be made.");
        }
    }

    ~Temporary() { std::filesystem::remove_all(path_); }

    Temporary(const Temporary&) = delete;
    Temporary& operator=(const Temporary&) = delete;

    [[nodiscard]] const std::string& path() const { return path_; }

  private:
    std::string path_;
};

} // namespace quorl::bench
