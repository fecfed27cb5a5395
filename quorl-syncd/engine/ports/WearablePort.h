#pragma once

#include <functional>
#include <memory>
#include <string>
#include <variant>

#include "services/wearable/Attachment.h"
#include "services/wearable/Usage.h"
#include "services/wearable/Wearable.h"

namespace quorl::syncd {

/// A wearable that is being looked after, from construction to destruction.
class WatchedWearable {
  public:
    /// The figures, or a sentence for the user that says why there are none.
    using Answer = std::variant<wearable::Usage, std::string>;
    using Reply = std::function<void(const Answer&)>;

    /// No call comes any more.
    virtual ~WatchedWearable() = default;

    [[nodiscard]] virtual const wearable::Wearable& identity() const = 0;

    /// Looks at the device. Returns at once; `reply` comes in a later turn, replies in the order of
    /// the questions. The figures are of a moment after the call.
    virtual void look(Reply reply) = 0;

    /// What was last saved; the default where nothing was, and for a mounted device.
    [[nodiscard]] virtual wearable::Attachment attachment() = 0;

    /// Of the embedded wearable only. Returns once it outlives a loss of power. Throws
    /// `std::system_error`.
    virtual void save(const wearable::Attachment& attachment) = 0;
};

/// What was noticed of a wearable.
enum class WearableNews {
    MayHaveChanged, ///< It is to be looked at again.
    WasMounted,     ///< What was a mere directory is a device: it is another wearable now.
};

/// Wearables that can be reached from this machine.
class WearablePort {
  public:
    using Noticed = std::function<void(WearableNews)>;

    virtual ~WearablePort() = default;

    /// Begins to look after the wearable in this directory, which need not be there; empty for the
    /// embedded one, which is made where it does not exist. `noticed` is called in turns of its
    /// own, and may destroy the wearable. Throws `std::filesystem::filesystem_error` or
    /// `std::system_error` where the embedded one cannot be made.
    [[nodiscard]] virtual std::unique_ptr<WatchedWearable> watch(const std::string& directory,
                                                                 Noticed noticed) = 0;
};

} // namespace quorl::syncd
