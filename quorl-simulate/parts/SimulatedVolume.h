#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "quorl-simulate/parts/SimulatedDisk.h"
#include "quorl-syncd/transfer/device/Volume.h"

namespace quorl::simulation {

/// A simulated disk as the file system of a wearable.
class SimulatedVolume final : public syncd::Volume {
  public:
    /// Says whether the disk cannot write what it is now to make durable.
    using FailsSync = std::function<bool()>;

    /// @param disk outlives the volume.
    explicit SimulatedVolume(
        SimulatedDisk& disk, FailsSync failsSync = [] { return false; })
        : disk_(disk), failsSync_(std::move(failsSync)) {}

    bool makeDirectory(Directory directory) override;
    void removeDirectory(Directory directory) override;
    [[nodiscard]] std::vector<std::string> names(Directory directory) override;
    [[nodiscard]] std::optional<base::FileState> find(Directory directory,
                                                      const std::string& name) override;
    [[nodiscard]] std::unique_ptr<base::Reader> open(Directory directory,
                                                     const std::string& name) override;
    [[nodiscard]] std::unique_ptr<syncd::VolumeFile> create(Directory directory,
                                                            const std::string& name) override;
    [[nodiscard]] std::unique_ptr<syncd::VolumeFile> overwrite(Directory directory,
                                                               const std::string& name) override;
    void rename(Directory directory, const std::string& name, const std::string& newName) override;
    void remove(Directory directory, const std::string& name) override;
    void syncDirectory(Directory directory) override;
    void sync() override;
    [[nodiscard]] std::uint64_t available() override;

  private:
    [[nodiscard]] SimulatedDisk::Node node(Directory directory) const;
    [[nodiscard]] SimulatedDisk::Node file(Directory directory, const std::string& name) const;

    SimulatedDisk& disk_;
    const FailsSync failsSync_;
};

/// The node of a directory of a wearable; nothing where it was not made yet.
[[nodiscard]] std::optional<SimulatedDisk::Node> directoryOf(const SimulatedDisk& disk,
                                                             syncd::Volume::Directory directory);

} // namespace quorl::simulation
