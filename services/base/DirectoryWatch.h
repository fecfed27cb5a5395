#pragma once

#include <optional>
#include <string>
#include <vector>

#include "services/base/FileDescriptor.h"

namespace quorl::base {

/// Notices changes in the entries of directories, through inotify. For one thread at a time.
class DirectoryWatch {
  public:
    /// What was noticed since the last `take`.
    struct Changes {
        /// The watches whose directories changed, or were deleted or unmounted and are watched no
        /// more; each perhaps several times.
        std::vector<int> changed;
        /// Some changes were not recorded: anything may have changed.
        bool lost = false;
    };

    /// Where the system gives no watching at all, every `add` fails.
    DirectoryWatch();

    /// Readable while there are changes to take; -1 where nothing can be watched.
    [[nodiscard]] int descriptor() const { return inotify_.get(); }

    /// Watches the directory at `path`, not following a symbolic link there. A directory that is
    /// watched already keeps its number. Null: it cannot be watched, errno says why.
    [[nodiscard]] std::optional<int> add(const std::string& path);

    /// Ends a watch. Changes that were noticed but not taken yet may still name it.
    void remove(int watch);

    /// Takes all that was noticed; never waits.
    [[nodiscard]] Changes take();

  private:
    FileDescriptor inotify_;
};

} // namespace quorl::base
