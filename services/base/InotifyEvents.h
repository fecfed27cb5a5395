#pragma once

#include <array>
#include <cerrno>
#include <cstddef>
#include <cstring>
#include <string_view>

#include <sys/inotify.h>
#include <unistd.h>

namespace quorl::base {

/// Calls `use(event, name)` with each inotify event that is ready on `descriptor`, which does not
/// block. `name` is empty for an event of the watched directory itself and valid during the call.
template <class Use>
void forEachInotifyEvent(int descriptor, Use use) {
    std::array<char, 65536>
        buffer; // NOLINT(cppcoreguidelines-pro-type-member-init): read() fills it
    for (;;) {
        const ssize_t size = read(descriptor, buffer.data(), buffer.size());
        if (size < 0 && errno == EINTR) {
            continue;
        }
        if (size <= 0) {
            return;
        }
        for (std::size_t at = 0; at < static_cast<std::size_t>(size);) {
            inotify_event event{};
            std::memcpy(&event, buffer.data() + at, sizeof event);
            // The name is padded with NULs up to the length that the event gives.
            const std::string_view padded(buffer.data() + at + sizeof event, event.len);
            use(event, padded.substr(0, padded.find('\0')));
            at += sizeof event + event.len;
        }
    }
}

} // namespace quorl::base
