#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "quorl-syncd/engine/ports/WearablePort.h"
#include "services/engine/EngineState.h"

namespace quorl::syncd {

/// The wearable that the engine syncs to: what it is, how it is attached, and how it stood when it
/// was last looked at.
class AttachedWearable {
  public:
    enum class Change {
        Figures,       ///< It was looked at.
        IsThereAgain,  ///< It was looked at, and was not there before.
        BecameAnother, ///< `choose` it anew, by its directory.
    };

    using Changed = std::function<void(Change)>;

    /// @param port outlives this.
    /// @param changed called in turns of its own, never within a call of this.
    AttachedWearable(WearablePort& port, Changed changed);

    /// Takes another one, of which nothing is known until it was looked at; to be called before
    /// anything else. Throws as `WearablePort::watch`; then all is as it was.
    void choose(const std::string& directory);

    /// Has it looked at again.
    void refresh();

    /// Throws `NotReady` for a mounted wearable, and where it cannot be remembered.
    void attach(const wearable::Attachment& attachment);

    /// All songs of the selection are on it; known before it is looked at again.
    void wasSent(const wearable::Selection& selection);

    [[nodiscard]] const wearable::Wearable& identity() const { return watched_->identity(); }

    [[nodiscard]] const wearable::Attachment& attachment() const { return attachment_; }

    /// Nothing while it is not there or was not looked at yet; then the problem says why.
    [[nodiscard]] const std::optional<wearable::Usage>& usage() const { return usage_; }

    [[nodiscard]] const std::string& problem() const { return problem_; }

    [[nodiscard]] engine::WearableStatus status() const;

  private:
    void notice(WearableNews news);
    void take(const WatchedWearable::Answer& answer);

    WearablePort& port_;
    const Changed changed_;
    wearable::Attachment attachment_;
    std::optional<wearable::Usage> usage_;
    std::string problem_;

    // The last member, for it calls this object.
    std::unique_ptr<WatchedWearable> watched_;
};

} // namespace quorl::syncd
