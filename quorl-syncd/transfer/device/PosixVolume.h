#pragma once

#include "quorl-syncd/transfer/device/Volume.h"
#include "services/base/FileDescriptor.h"
#include "services/wearable/Wearable.h"

namespace quorl::syncd {

/// The directory of a wearable, by system calls. What happens to its path in the meantime makes no
/// difference: everything goes to the directory that was there at the beginning.
///
/// Files, and our own directory, are for their owner alone; the music directory can be read by
/// everybody, as far as the umask lets it.
///
/// On FAT an `fsync` writes the name of a file or directory before the table that says where the
/// rest of it is. A loss of power between the two would leave a name that can be neither read nor
/// removed: the system takes the volume for broken. So there all is written in one go before, which
/// goes through the disk from the beginning, where the table is; a directory gets its name when it
/// is there; and a name is gone before its space is given anew.
class PosixVolume final : public Volume {
  public:
    /// Opens the wearable, and makes our own directory, which nobody else can open for a sync as
    /// long as this is there. Throws `SyncProblem` when another program is
    /// syncing to it.
    explicit PosixVolume(const wearable::Wearable& wearable);

    bool makeDirectory(Directory directory) override;
    void removeDirectory(Directory directory) override;
    [[nodiscard]] std::vector<std::string> names(Directory directory) override;
    [[nodiscard]] std::optional<base::FileState> find(Directory directory,
                                                      const std::string& name) override;
    [[nodiscard]] std::unique_ptr<base::Reader> open(Directory directory,
                                                     const std::string& name) override;
    [[nodiscard]] std::unique_ptr<VolumeFile> create(Directory directory,
                                                     const std::string& name) override;
    [[nodiscard]] std::unique_ptr<VolumeFile> overwrite(Directory directory,
                                                        const std::string& name) override;
    void rename(Directory directory, const std::string& name, const std::string& newName) override;
    void remove(Directory directory, const std::string& name) override;
    void syncDirectory(Directory directory) override;
    void sync() override;
    [[nodiscard]] std::uint64_t available() override;

  private:
    [[nodiscard]] bool lockOwn();
    [[nodiscard]] int descriptorOf(Directory directory) const;

    wearable::Wearable wearable_;
    base::FileDescriptor root_;
    bool isFat_ = false;
    base::FileDescriptor music_;
    base::FileDescriptor own_;
    /// By the constructor, and nobody was told yet.
    bool isOwnNew_ = false;
};

} // namespace quorl::syncd
