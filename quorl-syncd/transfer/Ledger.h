#pragma once

#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "quorl-syncd/transfer/Plan.h"
#include "quorl-syncd/transfer/device/Device.h"
#include "services/wearable/Manifest.h"

namespace quorl::syncd {

/// What of ours is on a device, or about to be. Each step of a sync is written here before it is
/// done, or after, so that the list on the device is right whenever the power goes: between two
/// calls of `save` the device must only be changed in ways that both lists allow.
class Ledger {
  public:
    /// Reads the list of the device, which outlives the ledger.
    explicit Ledger(Device& device);

    [[nodiscard]] const wearable::Manifest& manifest() const { return manifest_; }

    /// Whether the list is as the one on the device.
    [[nodiscard]] bool isSaved() const { return isSaved_; }

    /// Writes the list where it differs from the one on the device.
    void save();

    /// The device is looked through with `find`: forgets what is not there.
    void keepWhatIsThere(const FindFile& find, const Hashes& hashes);

    /// Files that an earlier sync has left behind are complete songs.
    void adopt(std::span<const wearable::Entry> songs) { songsAreThere(songs); }

    /// Names of files that were announced and may have come since, though the list does not say so.
    [[nodiscard]] std::vector<std::string> announced() const;

    /// Files that were about to be copied or removed are not there any more.
    void straysAreGone();

    /// What was sent is about to be changed.
    void withdrawClaim();

    /// These songs are to be removed.
    void putAside(std::vector<wearable::Entry> songs);

    /// Files are about to be put on the device under names that are free.
    void announce(std::vector<wearable::Entry> entries);

    /// What was announced under this name does not come.
    void revoke(std::string_view name);

    /// Those of the songs that have a hash are there, complete, where they were announced.
    void songsAreThere(std::span<const wearable::Entry> songs);

    /// The playlist was removed, or is somebody else's file by now.
    void playlistIsGone();

    /// The playlist is there, and the one before is gone.
    void playlistIsThere(const wearable::Entry& playlist);

    /// All other songs, and what was announced and never came, are to be removed.
    void keepOnly(std::vector<wearable::Entry> songs);

    /// Everything of the selection is there; of none where nothing was sent.
    void wasSent(const std::optional<wearable::Selection>& selection);

  private:
    template <class Value>
    void set(Value& value, Value changed);
    void addStrays(std::vector<wearable::Entry> strays);
    void addAnnounced(std::span<const wearable::Entry> songs);

    Device& device_;
    wearable::Manifest manifest_;
    bool isSaved_ = true;
};

} // namespace quorl::syncd
