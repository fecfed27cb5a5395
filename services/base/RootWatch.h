#pragma once

#include <filesystem>
#include <string>
#include <unordered_map>

#include "services/base/FileDescriptor.h"

namespace quorl::base {

/// Notices when the directory at a path may have become another one: made, deleted, renamed or
/// replaced, or one on the way to it. For one thread at a time.
class RootWatch {
  public:
    /// `root` is absolute and need not exist.
    explicit RootWatch(std::filesystem::path root);

    /// Readable while there is something to take; -1 where nothing can be watched.
    [[nodiscard]] int descriptor() const { return inotify_.get(); }

    /// Takes what was noticed; never waits. True: look for the directory anew.
    [[nodiscard]] bool take();

  private:
    void watchTheWay();

    std::filesystem::path root_;
    FileDescriptor inotify_;
    /// For each watched directory on the way, the name of the next one.
    std::unordered_map<int, std::string> nextNames_;
};

} // namespace quorl::base
