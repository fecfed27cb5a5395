#include "services/base/FileContents.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <system_error>

#include <unistd.h>

namespace quorl::base {

namespace {

[[noreturn]] void fail(const char* what) {
    throw std::system_error(errno, std::generic_category(), what);
}

} // namespace

std::size_t readSome(int file, std::span<std::byte> buffer) {
    for (;;) {
        const auto size = read(file, buffer.data(), buffer.size());
        if (size >= 0) {
            return static_cast<std::size_t>(size);
        }
        if (errno != EINTR) {
            fail("read");
        }
    }
}

std::string readAll(int file, std::size_t most) {
    std::string text;
    std::array<std::byte, 65536>
        buffer; // NOLINT(cppcoreguidelines-pro-type-member-init): readSome() fills it
    while (text.size() < most) {
        const auto size =
            readSome(file, std::span(buffer).first(std::min(buffer.size(), most - text.size())));
        if (size == 0) {
            break;
        }
        text.append(reinterpret_cast<const char*>(buffer.data()), size);
    }
    return text;
}

void writeAll(int file, std::span<const std::byte> bytes) {
    while (!bytes.empty()) {
        const auto written = write(file, bytes.data(), bytes.size());
        if (written < 0 && errno != EINTR) {
            fail("write");
        }
        bytes = bytes.subspan(written > 0 ? static_cast<std::size_t>(written) : 0);
    }
}

} // namespace quorl::base
