#pragma once

#include <filesystem>
#include <string>

#include "services/base/FileDescriptor.h"

namespace quorl::base {

/// Notices when a file system is mounted or unmounted at a directory, below it, or on the way to
/// it, which inotify does not tell. For one thread at a time.
class MountWatch {
  public:
    /// `root` is absolute and need not exist.
    explicit MountWatch(std::filesystem::path root);

    /// Shows POLLPRI while there is something to take; -1 where mounts cannot be watched.
    [[nodiscard]] int descriptor() const { return table_.get(); }

    /// Takes what was noticed; never waits. True: look at the directory anew.
    [[nodiscard]] bool take();

  private:
    [[nodiscard]] std::string describe() const;

    std::filesystem::path root_;
    FileDescriptor table_;
    /// The mounts that concern the directory.
    std::string known_;
};

} // namespace quorl::base
