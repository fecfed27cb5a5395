#include "quorl-simulate/Plant.h"

#include <cerrno>
#include <system_error>
#include <utility>

namespace quorl::simulation {

namespace {

/// Does all that it is told, for those below to leave something out.
class HonestVolume : public syncd::Volume {
  public:
    explicit HonestVolume(std::unique_ptr<Volume> volume) : volume_(std::move(volume)) {}

    bool makeDirectory(Directory directory) override { return volume_->makeDirectory(directory); }

    void removeDirectory(Directory directory) override { volume_->removeDirectory(directory); }

    [[nodiscard]] std::vector<std::string> names(Directory directory) override {
        return volume_->names(directory);
    }

    [[nodiscard]] std::optional<base::FileState> find(Directory directory,
                                                      const std::string& name) override {
        return volume_->find(directory, name);
    }

    [[nodiscard]] std::unique_ptr<base::Reader> open(Directory directory,
                                                     const std::string& name) override {
        return volume_->open(directory, name);
    }

    [[nodiscard]] std::unique_ptr<syncd::VolumeFile> create(Directory directory,
                                                            const std::string& name) override {
        return volume_->create(directory, name);
    }

    [[nodiscard]] std::unique_ptr<syncd::VolumeFile> overwrite(Directory directory,
                                                               const std::string& name) override {
        return volume_->overwrite(directory, name);
    }

    void rename(Directory directory, const std::string& name, const std::string& newName) override {
        volume_->rename(directory, name, newName);
    }

    void remove(Directory directory, const std::string& name) override {
        volume_->remove(directory, name);
    }

    void syncDirectory(Directory directory) override { volume_->syncDirectory(directory); }

    void sync() override { volume_->sync(); }

    [[nodiscard]] std::uint64_t available() override { return volume_->available(); }

  protected:
    [[nodiscard]] Volume& volume() { return *volume_; }

  private:
    const std::unique_ptr<Volume> volume_;
};

class HastyFile final : public syncd::VolumeFile {
  public:
    explicit HastyFile(std::unique_ptr<VolumeFile> file) : file_(std::move(file)) {}

    [[nodiscard]] bool share(int descriptor) override { return file_->share(descriptor); }

    void write(std::span<const std::byte> bytes) override { file_->write(bytes); }

    void setModified(std::int64_t nanoseconds) override { file_->setModified(nanoseconds); }

    void flush() override { file_->flush(); }

    void sync() override {}

  private:
    const std::unique_ptr<VolumeFile> file_;
};

struct NoFileSync final : HonestVolume {
    using HonestVolume::HonestVolume;

    [[nodiscard]] std::unique_ptr<syncd::VolumeFile> create(Directory directory,
                                                            const std::string& name) override {
        return std::make_unique<HastyFile>(volume().create(directory, name));
    }

    [[nodiscard]] std::unique_ptr<syncd::VolumeFile> overwrite(Directory directory,
                                                               const std::string& name) override {
        return std::make_unique<HastyFile>(volume().overwrite(directory, name));
    }

    void sync() override {}
};

struct NoDirectorySync final : HonestVolume {
    using HonestVolume::HonestVolume;

    void syncDirectory(Directory /*directory*/) override {}

    void sync() override {}
};

struct ManifestFirst final : HonestVolume {
    using HonestVolume::HonestVolume;

    void syncDirectory(Directory directory) override {
        if (directory != Directory::Music) {
            volume().syncDirectory(directory);
        }
    }

    void sync() override { syncDirectory(Directory::Own); }
};

struct RemovalFirst final : HonestVolume {
    using HonestVolume::HonestVolume;

    /// Removes the first song that is asked for, which is one that the list names.
    [[nodiscard]] std::optional<base::FileState> find(Directory directory,
                                                      const std::string& name) override {
        if (directory == Directory::Music && volume().find(directory, name) &&
            !std::exchange(isRemoved_, true)) {
            volume().remove(directory, name);
        }
        return volume().find(directory, name);
    }

  private:
    bool isRemoved_ = false;
};

struct NoOwnership final : HonestVolume {
    using HonestVolume::HonestVolume;

    void rename(Directory directory, const std::string& name, const std::string& newName) override {
        try {
            volume().rename(directory, name, newName);
        } catch (const std::system_error& error) {
            if (error.code().value() != EEXIST) {
                throw;
            }
            volume().remove(directory, newName);
            volume().rename(directory, name, newName);
        }
    }
};

} // namespace

std::unique_ptr<syncd::Volume> planted(Plant plant, std::unique_ptr<syncd::Volume> volume) {
    switch (plant) {
    case Plant::NoFileSync:
        return std::make_unique<NoFileSync>(std::move(volume));
    case Plant::NoDirectorySync:
        return std::make_unique<NoDirectorySync>(std::move(volume));
    case Plant::ManifestFirst:
        return std::make_unique<ManifestFirst>(std::move(volume));
    case Plant::RemovalFirst:
        return std::make_unique<RemovalFirst>(std::move(volume));
    case Plant::NoOwnership:
        return std::make_unique<NoOwnership>(std::move(volume));
    case Plant::None:
    case Plant::SentBeforeManifest:
    case Plant::NoRetry:
        break;
    }
    return volume;
}

} // namespace quorl::simulation
