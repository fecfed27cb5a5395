#include "quorl/terminal/sheets/HeldErrors.h"

#include <array>

#include <fcntl.h>
#include <sys/mman.h>
#include <unistd.h>

namespace quorl {

HeldErrors::~HeldErrors() { release(); }

void HeldErrors::hold() {
    if (standardError_ || isatty(STDERR_FILENO) == 0) {
        return;
    }
    if (!kept_) { // once, for a process that was started before goes on writing to it
        kept_ = base::FileDescriptor(memfd_create("errors", MFD_CLOEXEC));
    }
    base::FileDescriptor before(fcntl(STDERR_FILENO, F_DUPFD_CLOEXEC, STDERR_FILENO + 1));
    if (kept_ && before && dup2(kept_.get(), STDERR_FILENO) >= 0) {
        standardError_ = std::move(before);
    }
}

void HeldErrors::release() {
    if (standardError_) {
        dup2(standardError_.get(), STDERR_FILENO);
        standardError_ = base::FileDescriptor();
        say();
    }
}

void HeldErrors::say() {
    std::array<char, 4096> buffer; // NOLINT(cppcoreguidelines-pro-type-member-init): read fills it
    for (;;) {
        const ssize_t length = pread(kept_.get(), buffer.data(), buffer.size(), said_);
        if (length <= 0 ||
            write(STDERR_FILENO, buffer.data(), static_cast<std::size_t>(length)) != length) {
            return;
        }
        said_ += length;
    }
}

} // namespace quorl
