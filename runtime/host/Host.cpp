#include "runtime/host/Host.h"

#include <chrono>
#include <cstdio>
#include <cstdlib>

namespace quorl {

namespace {

constinit Host* installed = nullptr;

} // namespace

void Host::install(std::shared_ptr<Host> host) {
    // Never destroyed: panes and process-wide objects of plug-ins may outlive `main`.
    static auto* const kept = new std::shared_ptr<Host>;
    installed = host.get();
    *kept = std::move(host);
}

Host* Host::current() { return installed; }

Host& Host::required() {
    if (!installed) {
        std::fputs("quorl: a pane was used before a host was installed\n", stderr);
        std::abort();
    }
    return *installed;
}

std::shared_ptr<PSSpecifier> Host::glanceSpecifier(const std::string& /*identifier*/) {
    return nullptr;
}

double Host::secondsSince1970() {
    return std::chrono::duration<double>(std::chrono::system_clock::now().time_since_epoch())
        .count();
}

} // namespace quorl
