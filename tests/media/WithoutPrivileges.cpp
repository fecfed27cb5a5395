#include "tests/media/WithoutPrivileges.h"

#include <thread>

#include <sys/fsuid.h>
#include <unistd.h>

namespace quorl::media::test {

namespace {

constexpr uid_t nobody = 65534;

} // namespace

WithoutPrivileges::WithoutPrivileges() : dropped_(geteuid() == 0) {
    if (dropped_) {
        setfsuid(nobody);
    }
}

WithoutPrivileges::~WithoutPrivileges() {
    if (dropped_) {
        setfsuid(0);
    }
}

void withPrivileges(const std::function<void()>& act) {
    // The rights are those of the thread.
    std::thread([&act] {
        setfsuid(geteuid());
        act();
    }).join();
}

} // namespace quorl::media::test
