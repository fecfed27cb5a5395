#pragma once

#include <map>
#include <string>
#include <vector>

#include <sys/types.h>

#include "services/base/FileDescriptor.h"

namespace quorl::syncd::testing {

/// A program that the test has started; killed at the end.
class Process {
  public:
    /// @param environment on top of the test's own.
    explicit Process(const std::vector<std::string>& command,
                     const std::map<std::string, std::string>& environment = {});
    ~Process();

    Process(const Process&) = delete;
    Process& operator=(const Process&) = delete;

    void signal(int number) const;

    /// Waits for the end; gives back the exit code, or minus the number of the signal that ended
    /// the program.
    int wait();

    /// Waits for the next line of its output, without the line's end; empty at the end.
    [[nodiscard]] std::string nextLine();

    /// All that it has said until its end and that was not read yet.
    [[nodiscard]] std::string rest();

  private:
    pid_t id_ = -1;
    /// Both its output and its errors.
    base::FileDescriptor output_;
};

/// One more message bus, in the session's directory.
class SecondBus {
  public:
    SecondBus();

    [[nodiscard]] const std::string& address() const { return address_; }

    void kill();

  private:
    std::string address_;
    Process daemon_;
};

} // namespace quorl::syncd::testing
