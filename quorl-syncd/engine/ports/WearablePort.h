#pragma once

#include <functional>
#include <memory>
#include <string>
#include <variant>

#include "services/wearable/Attachment.h"
#include "services/wearable/Usage.h"
#include "services/wearable/Wearable.h"

namespace quorl::syncd {

/// How a wearable stood at one moment.
struct Sight {
    wearable::Wearable identity;
    wearable::Usage usage;
    /// What was last saved; the default where nothing was, and for a mounted device.
    wearable::Attachment attachment;
};

/// A wearable that is being looked after, from construction to destruction.
class WatchedWearable {
  public:
    using Answer = std::variant<Sight, wearable::Unseen>;
    using Reply = std::function<void(const Answer&)>;
    /// Is given an empty text, or a sentence that says why it could not be done.
    using Saved = std::function<void(const std::string& problem)>;

    /// No call comes any more.
    virtual ~WatchedWearable() = default;

    /// As far as it is known without looking: whether something is mounted there is not.
    [[nodiscard]] virtual wearable::Wearable identity() const = 0;

    /// Looks at the device. Returns at once; `reply` comes in a later turn, replies in the order of
    /// the questions. The figures are of a moment after the call.
    virtual void look(Reply reply) = 0;

    /// Of the embedded wearable only. Returns at once; `saved` comes in a later turn, once it
    /// outlives a loss of power. It is saved also where this object is destroyed meanwhile, unless
    /// the device does not answer. Called again before that, it waits a while for the former.
    virtual void save(const wearable::AttachmentChange& change, Saved saved) = 0;
};

/// What was noticed of a wearable.
enum class WearableNews {
    MayHaveChanged, ///< Somebody has changed what is on it.
    MayBeAnother,   ///< It was plugged in or out: nothing is known of it any more.
};

/// Wearables that can be reached from this machine.
class WearablePort {
  public:
    using Noticed = std::function<void(WearableNews)>;

    virtual ~WearablePort() = default;

    /// Begins to look after the wearable in this directory, which need not be there; empty for the
    /// embedded one, which is made where it does not exist. Returns at once. `noticed` is called in
    /// turns of its own. Throws `std::system_error` where no more threads can be started.
    [[nodiscard]] virtual std::unique_ptr<WatchedWearable> watch(const std::string& directory,
                                                                 Noticed noticed) = 0;
};

} // namespace quorl::syncd
