#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>
#include <string>

#include "quorl-syncd/transfer/device/Volume.h"

namespace quorl::syncd {

/// A file on the device that does not have its name yet, open for writing. Made and named by a
/// `Device`. Every failure throws `std::system_error`.
class UnfinishedFile {
  public:
    /// @param name the one that it has until it is finished.
    UnfinishedFile(std::string name, std::unique_ptr<VolumeFile> file);

    [[nodiscard]] const std::string& name() const { return name_; }

    /// Has the empty file share the contents of an open file of this machine, so that nothing has
    /// to be written. False: the device cannot, and the file is as it was.
    [[nodiscard]] bool share(int descriptor) { return file_->share(descriptor); }

    /// Appends. What is written need not be on the device before `Device::settle`.
    void write(std::span<const std::byte> bytes);

    /// Nothing more is written: gives the file its modification time, in nanoseconds since 1970,
    /// where the device keeps any, has the device begin with much that it still holds back, and
    /// closes the file.
    void complete(std::int64_t modified);

  private:
    std::string name_;
    std::unique_ptr<VolumeFile> file_;
    std::uint64_t heldBack_ = 0;
};

} // namespace quorl::syncd
