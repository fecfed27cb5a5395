#include "services/engine/Mailbox.h"

#include <cerrno>
#include <system_error>
#include <utility>

#include <sys/eventfd.h>

namespace quorl::engine {

Mailbox::Mailbox() : wake_(eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK)) {
    if (!wake_) {
        throw std::system_error{errno, std::generic_category(), "eventfd"};
    }
}

void Mailbox::post(Work work) {
    {
        const std::scoped_lock lock(mutex_);
        posted_.push_back(std::move(work));
    }
    static_cast<void>(eventfd_write(wake_.get(), 1));
}

std::vector<Mailbox::Work> Mailbox::take() {
    eventfd_t count = 0;
    static_cast<void>(eventfd_read(wake_.get(), &count));
    const std::scoped_lock lock(mutex_);
    return std::exchange(posted_, {});
}

} // namespace quorl::engine
