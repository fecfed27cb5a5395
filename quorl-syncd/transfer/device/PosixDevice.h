#pragma once

#include "quorl-syncd/transfer/device/Device.h"
#include "services/base/FileDescriptor.h"
#include "services/wearable/Wearable.h"

namespace quorl::syncd {

/// The directory of a wearable. What happens to its path in the meantime makes no difference:
/// everything goes to the directory that was there at the beginning.
class PosixDevice final : public Device {
  public:
    /// Opens the wearable and makes the directories that we need on it. Throws `std::runtime_error`
    /// with a sentence when another program is syncing to it.
    explicit PosixDevice(const wearable::Wearable& wearable);

    [[nodiscard]] wearable::Manifest loadManifest() override;
    void saveManifest(const wearable::Manifest& manifest) override;
    [[nodiscard]] std::uint64_t available() override;
    [[nodiscard]] std::vector<std::string> musicNames() override;
    [[nodiscard]] std::optional<base::FileState> find(const std::string& name) override;
    [[nodiscard]] std::unique_ptr<Reader> openMusic(const std::string& name) override;
    void removeMusic(const std::string& name) override;
    [[nodiscard]] std::unique_ptr<UnfinishedFile>
    createUnfinished(const std::string& name) override;
    void finish(const std::string& unfinished, const std::string& name, IfThere ifThere) override;
    void removeUnfinished() override;
    void syncMusic() override;

  private:
    wearable::Wearable wearable_;
    base::FileDescriptor root_;
    base::FileDescriptor music_;
    base::FileDescriptor own_;
};

} // namespace quorl::syncd
