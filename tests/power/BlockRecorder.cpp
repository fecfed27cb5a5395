// Loaded into a user-mode Linux: records what its kernel writes to a disk, write by write.
//
// Environment: QUORL_RECORDED_DISK is the image of the disk, QUORL_BLOCK_LOG the file for the log,
// which `BlockLog` reads.

#include <algorithm>
#include <array>
#include <cstdarg>
#include <cstdint>
#include <cstdlib>
#include <cstring>

#include <elf.h>
#include <fcntl.h>
#include <sys/ptrace.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <sys/uio.h>
#include <unistd.h>

namespace {

struct Recorder {
    Recorder() {
        const auto* const image = getenv("QUORL_RECORDED_DISK");
        const auto* const path = getenv("QUORL_BLOCK_LOG");
        if (image != nullptr && path != nullptr && stat(image, &disk) == 0) {
            log = open(path, O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC, 0600);
        }
    }

    [[nodiscard]] bool isDisk(int descriptor) const {
        struct stat status {};

        return log >= 0 && fstat(descriptor, &status) == 0 && status.st_ino == disk.st_ino &&
               status.st_dev == disk.st_dev;
    }

    void record(std::uint64_t offset, const void* data, std::uint64_t size) const {
        std::array<std::uint64_t, 2> head{offset, size};
        const iovec parts[]{{head.data(), sizeof head}, {const_cast<void*>(data), size}};
        if (writev(log, parts, 2) != static_cast<ssize_t>(sizeof head + size)) {
            abort(); // a log with a hole would show states that never were
        }
    }

    struct stat disk {};

    int log = -1;
};

const Recorder recorder;

/// The state of a guest's vector registers is longer on new processors than its kernel knows. The
/// host takes it only as a whole: what is beyond stays as it is.
long setRegisters(long process, const iovec& known) {
    static std::array<std::byte, 65536> whole;
    const auto set = reinterpret_cast<void*>(NT_X86_XSTATE);
    iovec all{whole.data(), whole.size()};
    if (syscall(SYS_ptrace, PTRACE_GETREGSET, process, set, &all) != 0) {
        return -1;
    }
    std::memcpy(whole.data(), known.iov_base, std::min(known.iov_len, all.iov_len));
    return syscall(SYS_ptrace, PTRACE_SETREGSET, process, set, &all);
}

} // namespace

extern "C" ssize_t pwrite64(int descriptor, const void* data, size_t size, off64_t offset) {
    const auto written = syscall(SYS_pwrite64, descriptor, data, size, offset);
    if (written > 0 && recorder.isDisk(descriptor)) {
        recorder.record(static_cast<std::uint64_t>(offset), data,
                        static_cast<std::uint64_t>(written));
    }
    return written;
}

extern "C" long ptrace(__ptrace_request request, ...) {
    va_list arguments;
    va_start(arguments, request);
    const auto process = va_arg(arguments, long);
    auto* const address = va_arg(arguments, void*);
    auto* const data = va_arg(arguments, void*);
    va_end(arguments);
    if (request == PTRACE_SETREGSET && address == reinterpret_cast<void*>(NT_X86_XSTATE)) {
        return setRegisters(process, *static_cast<const iovec*>(data));
    }
    long word = 0;
    const bool isPeek =
        request == PTRACE_PEEKTEXT || request == PTRACE_PEEKDATA || request == PTRACE_PEEKUSER;
    const auto result =
        syscall(SYS_ptrace, request, process, address, isPeek ? static_cast<void*>(&word) : data);
    return isPeek && result == 0 ? word : result;
}
