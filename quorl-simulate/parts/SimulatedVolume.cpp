#include "quorl-simulate/parts/SimulatedVolume.h"

#include <algorithm>
#include <cerrno>
#include <system_error>

#include "services/wearable/Wearable.h"

namespace quorl::simulation {

namespace {

using syncd::Volume;

std::string nameOf(Volume::Directory directory) {
    return directory == Volume::Directory::Music ? wearable::musicDirectory
                                                 : wearable::ownDirectory;
}

class SimulatedReader final : public base::Reader {
  public:
    SimulatedReader(const SimulatedDisk& disk, SimulatedDisk::Node file)
        : disk_(disk), file_(file) {}

    [[nodiscard]] std::size_t read(std::span<std::byte> buffer) override {
        const auto rest = std::as_bytes(std::span(disk_.read(file_)));
        const auto begin = std::min(read_, rest.size());
        const auto piece = rest.subspan(begin, std::min(buffer.size(), rest.size() - begin));
        std::ranges::copy(piece, buffer.begin());
        read_ += piece.size();
        return piece.size();
    }

  private:
    const SimulatedDisk& disk_;
    const SimulatedDisk::Node file_;
    std::size_t read_ = 0;
};

class SimulatedFile final : public syncd::VolumeFile {
  public:
    SimulatedFile(SimulatedDisk& disk, SimulatedDisk::Node file,
                  SimulatedVolume::FailsSync failsSync)
        : disk_(disk), file_(file), failsSync_(std::move(failsSync)) {}

    [[nodiscard]] bool share(int /*descriptor*/) override { return false; }

    void write(std::span<const std::byte> bytes) override {
        std::string text(bytes.size(), '\0');
        std::ranges::transform(bytes, text.begin(),
                               [](std::byte byte) { return static_cast<char>(byte); });
        disk_.write(file_, written_, text);
        written_ += text.size();
    }

    void setModified(std::int64_t nanoseconds) override { disk_.setModified(file_, nanoseconds); }

    void flush() override {}

    /// On FAT all is written before, in one go.
    void sync() override {
        if (failsSync_()) {
            disk_.rules() == DiskRules::Fat ? disk_.failSyncAll() : disk_.failSync(file_);
        }
        disk_.sync(file_);
    }

  private:
    SimulatedDisk& disk_;
    const SimulatedDisk::Node file_;
    const SimulatedVolume::FailsSync failsSync_;
    std::size_t written_ = 0;
};

} // namespace

std::optional<SimulatedDisk::Node> directoryOf(const SimulatedDisk& disk,
                                               Volume::Directory directory) {
    return directory == Volume::Directory::Top ? SimulatedDisk::top
                                               : disk.find(SimulatedDisk::top, nameOf(directory));
}

SimulatedDisk::Node SimulatedVolume::node(Directory directory) const {
    const auto found = directoryOf(disk_, directory);
    if (!found) {
        throw std::system_error(ENOENT, std::generic_category());
    }
    return *found;
}

SimulatedDisk::Node SimulatedVolume::file(Directory directory, const std::string& name) const {
    const auto found = disk_.find(node(directory), name);
    if (!found) {
        throw std::system_error(ENOENT, std::generic_category(), name);
    }
    return *found;
}

bool SimulatedVolume::makeDirectory(Directory directory) {
    if (directoryOf(disk_, directory)) {
        return false;
    }
    static_cast<void>(disk_.makeDirectory(SimulatedDisk::top, nameOf(directory)));
    return true;
}

void SimulatedVolume::removeDirectory(Directory directory) {
    disk_.remove(SimulatedDisk::top, nameOf(directory));
}

std::vector<std::string> SimulatedVolume::names(Directory directory) {
    disk_.look("readdir", nameOf(directory));
    return disk_.names(node(directory));
}

std::optional<base::FileState> SimulatedVolume::find(Directory directory, const std::string& name) {
    disk_.look("stat", name);
    const auto found = disk_.find(node(directory), name);
    if (!found || disk_.status(*found).isDirectory) {
        return std::nullopt;
    }
    const auto status = disk_.status(*found);
    return base::FileState{status.size, status.modified};
}

std::unique_ptr<base::Reader> SimulatedVolume::open(Directory directory, const std::string& name) {
    disk_.look("open", name);
    return std::make_unique<SimulatedReader>(disk_, file(directory, name));
}

std::unique_ptr<syncd::VolumeFile> SimulatedVolume::create(Directory directory,
                                                           const std::string& name) {
    return std::make_unique<SimulatedFile>(disk_, disk_.create(node(directory), name), failsSync_);
}

std::unique_ptr<syncd::VolumeFile> SimulatedVolume::overwrite(Directory directory,
                                                              const std::string& name) {
    disk_.look("open", name);
    return std::make_unique<SimulatedFile>(disk_, file(directory, name), failsSync_);
}

void SimulatedVolume::rename(Directory directory, const std::string& name,
                             const std::string& newName) {
    disk_.rename(node(directory), name, node(directory), newName);
}

void SimulatedVolume::remove(Directory directory, const std::string& name) {
    disk_.remove(node(directory), name);
}

void SimulatedVolume::syncDirectory(Directory directory) {
    if (failsSync_()) {
        disk_.failSync(node(directory));
    }
    disk_.sync(node(directory));
}

void SimulatedVolume::sync() {
    if (failsSync_()) {
        disk_.failSyncAll();
    }
    disk_.syncAll();
}

std::uint64_t SimulatedVolume::available() {
    disk_.look("statfs", {});
    return disk_.available();
}

} // namespace quorl::simulation
