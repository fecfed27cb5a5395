#pragma once

#include <functional>
#include <memory>
#include <string>

#include "services/media/Inventory.h"

namespace quorl::syncd {

/// A music folder that is being looked after, from construction to destruction.
class WatchedMusic {
  public:
    /// No call comes any more.
    virtual ~WatchedMusic() = default;

    /// Has everything read again.
    virtual void rescan() = 0;
};

/// Music folders.
class MusicPort {
  public:
    /// Is given the first inventory, and each that differs from the one before, never null; each in
    /// a turn of its own.
    using Changed = std::function<void(std::shared_ptr<const media::Inventory>)>;

    virtual ~MusicPort() = default;

    /// The user's own music folder.
    [[nodiscard]] virtual std::string usualFolder() = 0;

    /// Begins to read and watch a folder, which need not be there. Returns at once; the first call
    /// of `changed` comes in a later turn. Throws `std::system_error`.
    [[nodiscard]] virtual std::unique_ptr<WatchedMusic> watch(const std::string& folder,
                                                              Changed changed) = 0;
};

} // namespace quorl::syncd
