#pragma once

#include <utility>

#include <unistd.h>

namespace quorl::base {

/// Owns an open file descriptor, or none (-1), and closes it.
class FileDescriptor {
  public:
    FileDescriptor() = default;

    explicit FileDescriptor(int descriptor) : descriptor_(descriptor) {}

    FileDescriptor(FileDescriptor&& other) noexcept : descriptor_(other.release()) {}

    FileDescriptor& operator=(FileDescriptor&& other) noexcept {
        std::swap(descriptor_, other.descriptor_);
        return *this;
    }

    ~FileDescriptor() {
        if (descriptor_ >= 0) {
            close(descriptor_);
        }
    }

    [[nodiscard]] explicit operator bool() const { return descriptor_ >= 0; }

    [[nodiscard]] int get() const { return descriptor_; }

    /// Hands the descriptor over to the caller, who closes it.
    [[nodiscard]] int release() { return std::exchange(descriptor_, -1); }

  private:
    int descriptor_ = -1;
};

} // namespace quorl::base
