#include "tests/engine/Process.h"

#include <csignal>
#include <cstdlib>
#include <stdexcept>

#include <fcntl.h>
#include <sys/wait.h>
#include <unistd.h>

#include "services/base/FileContents.h"

namespace quorl::syncd::testing {

namespace {

std::string newAddress() {
    static int number = 0;
    return std::string{"unix:path="} + std::getenv("XDG_RUNTIME_DIR") + "/bus-" +
           std::to_string(++number);
}

} // namespace

Process::Process(const std::vector<std::string>& command,
                 const std::map<std::string, std::string>& environment) {
    int ends[2] = {};
    if (pipe2(ends, O_CLOEXEC) != 0) {
        throw std::runtime_error{"pipe"};
    }
    output_ = base::FileDescriptor{ends[0]};
    const base::FileDescriptor input{ends[1]};
    std::vector<char*> arguments;
    for (const auto& argument : command) {
        arguments.push_back(const_cast<char*>(argument.c_str()));
    }
    arguments.push_back(nullptr);
    id_ = fork();
    if (id_ == 0) {
        for (const auto& [name, value] : environment) {
            setenv(name.c_str(), value.c_str(), 1);
        }
        dup2(input.get(), STDOUT_FILENO);
        dup2(input.get(), STDERR_FILENO);
        execv(arguments.front(), arguments.data());
        _exit(127);
    }
}

Process::~Process() {
    if (id_ > 0) {
        signal(SIGKILL);
        wait();
    }
}

void Process::signal(int number) const {
    if (id_ > 0) {
        kill(id_, number);
    }
}

int Process::wait() {
    int status = 0;
    while (waitpid(id_, &status, 0) < 0 && errno == EINTR) {
    }
    id_ = -1;
    return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
}

std::string Process::nextLine() {
    std::string line;
    char byte = 0;
    while (read(output_.get(), &byte, 1) == 1 && byte != '\n') {
        line += byte;
    }
    return line;
}

std::string Process::rest() { return base::readAll(output_.get()); }

SecondBus::SecondBus()
    : address_{newAddress()},
      daemon_{{DBUS_DAEMON, std::string{"--config-file="} + std::getenv("QUORL_TEST_BUS_CONFIG"),
               "--nofork", "--print-address", "--address=" + address_}} {
    // It prints its address when it can be reached.
    static_cast<void>(daemon_.nextLine());
}

void SecondBus::kill() {
    daemon_.signal(SIGKILL);
    daemon_.wait();
}

} // namespace quorl::syncd::testing
