#include "runtime/host/Host.h"

#include <chrono>
#include <cstdio>
#include <cstdlib>

namespace quorl {

namespace {

/// Never destroyed: panes and process-wide objects of plug-ins may outlive `main`.
std::shared_ptr<Host>& installed() {
    static auto* const host = new std::shared_ptr<Host>;
    return *host;
}

} // namespace

void Host::install(std::shared_ptr<Host> host) { installed() = std::move(host); }

Host* Host::current() { return installed().get(); }

Host& Host::required() {
    if (!current()) {
        std::fputs("quorl: a pane was used before a host was installed\n", stderr);
        std::abort();
    }
    return *current();
}

std::shared_ptr<PSSpecifier> Host::glanceSpecifier(const std::string& /*identifier*/) {
    return nullptr;
}

double Host::secondsSince1970() {
    return std::chrono::duration<double>(std::chrono::system_clock::now().time_since_epoch())
        .count();
}

} // namespace quorl
