#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "services/base/FileDescriptor.h"
#include "services/wearable/Manifest.h"
#include "services/wearable/Wearable.h"

namespace quorl::syncd {

/// The directory of a wearable, open for one sync. What happens to its path in the meantime makes
/// no difference: everything goes to the directory that was there at the beginning.
///
/// Every failure throws `std::system_error`, unless another one is named.
class Device {
  public:
    /// Opens the wearable and makes the directories that we need on it. Throws `std::runtime_error`
    /// with a sentence when another program is syncing to it.
    explicit Device(const wearable::Wearable& wearable);

    [[nodiscard]] wearable::Manifest loadManifest() const {
        return wearable::loadManifest(root_.get());
    }

    void save(const wearable::Manifest& manifest) const {
        wearable::saveManifest(root_.get(), manifest);
    }

    /// What may still be written, in bytes.
    [[nodiscard]] std::uint64_t available() const;

    /// Of everything in the music directory, whoever put it there.
    [[nodiscard]] std::vector<std::string> musicNames() const;

    /// Whether the file of an entry that was complete is still there.
    [[nodiscard]] bool has(const wearable::Entry& entry) const;

    /// Whether there is a file of this name in the music directory.
    [[nodiscard]] bool hasFile(const std::string& name) const;

    /// Whether the file of this name is the one that we were about to put there or to remove, and
    /// not one that somebody else has put there since.
    [[nodiscard]] bool isOurs(const wearable::Entry& stray) const;

    /// Opens a file of the music directory for reading.
    [[nodiscard]] base::FileDescriptor openMusic(const std::string& name) const;

    void removeMusic(const std::string& name) const;

    /// Makes an empty file that is not in the music directory yet.
    [[nodiscard]] base::FileDescriptor createUnfinished(const std::string& name) const;

    /// Moves a complete file into the music directory. Throws `EEXIST` where there is a file of
    /// that name. Only outlives a loss of power after `syncMusic`.
    void finish(const std::string& unfinished, const std::string& name) const;

    /// Removes all that `createUnfinished` has made, in this sync and in earlier ones.
    void removeUnfinished() const;

    void syncMusic() const;

    /// Writes a small file of the music directory, and waits until it is on the device. Throws
    /// `EEXIST` where there is a file of that name.
    void writeMusic(const std::string& name, std::string_view text) const;

    /// As `writeMusic`, in the place of a file of which it is known that it is ours.
    void replaceMusic(const std::string& name, std::string_view text) const;

  private:
    void writeUnfinished(const std::string& name, std::string_view text) const;

    wearable::Wearable wearable_;
    base::FileDescriptor root_;
    base::FileDescriptor music_;
    base::FileDescriptor own_;
};

} // namespace quorl::syncd
