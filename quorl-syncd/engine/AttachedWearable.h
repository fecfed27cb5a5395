#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "quorl-syncd/engine/ports/WearablePort.h"
#include "services/engine/EngineState.h"
#include "services/engine/Message.h"

namespace quorl::syncd {

/// The wearable that the engine syncs to: what it is, how it is attached, and how it stood when it
/// was last looked at.
class AttachedWearable {
  public:
    enum class Change {
        Figures,      ///< It was looked at, or is to be.
        Contents,     ///< Somebody has changed what is on it, perhaps we: it may be refreshed.
        IsThereAgain, ///< It was looked at, and was not there before, or was another one.
    };

    using Changed = std::function<void(Change)>;

    /// @param port outlives this.
    /// @param changed called in turns of its own, never within a call of this.
    AttachedWearable(WearablePort& port, Changed changed);

    /// Has what was not saved yet be saved still.
    ~AttachedWearable();

    AttachedWearable(const AttachedWearable&) = delete;
    AttachedWearable& operator=(const AttachedWearable&) = delete;

    /// Takes another one, of which nothing is known until it was looked at; to be called before
    /// anything else. Throws as `WearablePort::watch`; then all is as it was.
    void choose(const std::string& directory);

    /// Has it looked at again.
    void refresh();

    /// Counts at once, and is saved on the wearable some time later; where that fails, what was
    /// saved before counts again. Throws `NotReady` for a mounted wearable.
    void attach(const wearable::AttachmentChange& change);

    /// All songs of the selection are on it; known before it is looked at again, which is due.
    void wasSent(const wearable::Selection& selection);

    [[nodiscard]] const wearable::Wearable& identity() const { return identity_; }

    [[nodiscard]] wearable::Attachment attachment() const;

    /// Nothing while it is not there or was not looked at yet; then the problem says why.
    [[nodiscard]] const std::optional<wearable::Usage>& usage() const { return usage_; }

    [[nodiscard]] engine::Message problem() const;

    /// It was there, or may be, and does not answer.
    [[nodiscard]] bool isSilent() const { return problem_.isSilence; }

    /// Whether there was no answer yet since it may have become another one.
    [[nodiscard]] bool isLookedFor() const { return isLookedFor_; }

    [[nodiscard]] engine::WearableStatus status() const;

  private:
    void forget();
    void notice(WearableNews news);
    void take(const WatchedWearable::Answer& answer);
    [[nodiscard]] Change takeSight(const Sight& sight);
    void save();
    void saveLastWish();
    void wasSaved(const wearable::Attachment& attachment, const std::string& problem);

    WearablePort& port_;
    const Changed changed_;
    wearable::Wearable identity_;

    /// As it is on the wearable; nothing as long as that is not known.
    std::optional<wearable::Attachment> saved_;
    wearable::AttachmentChange wished_;
    /// Nothing where nothing is being saved.
    std::optional<wearable::Attachment> saving_;

    std::optional<wearable::Usage> usage_;
    wearable::Unseen problem_;
    bool isLookedFor_ = false;
    /// What was seen before the last change of it does not count.
    unsigned changes_ = 0;
    /// By the last answer.
    bool wasThere_ = false;

    // The last member, for it calls this object.
    std::unique_ptr<WatchedWearable> watched_;
};

} // namespace quorl::syncd
