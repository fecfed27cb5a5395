#pragma once

#include <functional>
#include <span>
#include <string>
#include <utility>

#include "quorl-syncd/transfer/device/Volume.h"
#include "tests/engine/transfer/Step.h"

namespace quorl::syncd::testing {

/// A volume that tells of each step of another one before that takes it. Nothing is ever waited
/// for, as no power is lost in a test.
class ObservedVolume final : public Volume {
  public:
    /// What it throws is what happens instead of the step.
    using Before = std::function<void(const Step&)>;

    ObservedVolume(std::unique_ptr<Volume> volume, Before before)
        : volume_(std::move(volume)), before_(std::move(before)) {}

    bool makeDirectory(Directory directory) override {
        before_({"make", path(directory, ""), ""});
        return volume_->makeDirectory(directory);
    }

    void removeDirectory(Directory directory) override {
        before_({"remove", path(directory, ""), ""});
        volume_->removeDirectory(directory);
    }

    [[nodiscard]] std::vector<std::string> names(Directory directory) override {
        before_({"list", path(directory, ""), ""});
        return volume_->names(directory);
    }

    [[nodiscard]] std::optional<base::FileState> find(Directory directory,
                                                      const std::string& name) override {
        before_({"find", path(directory, name), ""});
        return volume_->find(directory, name);
    }

    [[nodiscard]] std::unique_ptr<base::Reader> open(Directory directory,
                                                     const std::string& name) override {
        before_({"open", path(directory, name), ""});
        return volume_->open(directory, name);
    }

    [[nodiscard]] std::unique_ptr<VolumeFile> create(Directory directory,
                                                     const std::string& name) override {
        before_({"create", path(directory, name), ""});
        return observed(path(directory, name), volume_->create(directory, name));
    }

    [[nodiscard]] std::unique_ptr<VolumeFile> overwrite(Directory directory,
                                                        const std::string& name) override {
        before_({"overwrite", path(directory, name), ""});
        return observed(path(directory, name), volume_->overwrite(directory, name));
    }

    void rename(Directory directory, const std::string& name, const std::string& newName) override {
        before_({"rename", path(directory, name), newName});
        volume_->rename(directory, name, newName);
    }

    void remove(Directory directory, const std::string& name) override {
        before_({"remove", path(directory, name), ""});
        volume_->remove(directory, name);
    }

    void syncDirectory(Directory directory) override {
        before_({"fsync", path(directory, ""), ""});
    }

    void sync() override { before_({"sync", "", ""}); }

    [[nodiscard]] std::uint64_t available() override {
        before_({"available", "", ""});
        return volume_->available();
    }

  private:
    class File final : public VolumeFile {
      public:
        File(std::string path, std::unique_ptr<VolumeFile> file, const Before& before)
            : path_(std::move(path)), file_(std::move(file)), before_(before) {}

        /// So that everything is written.
        [[nodiscard]] bool share(int /*descriptor*/) override { return false; }

        void write(std::span<const std::byte> bytes) override {
            before_({"write", path_, {reinterpret_cast<const char*>(bytes.data()), bytes.size()}});
            file_->write(bytes);
        }

        void setModified(std::int64_t nanoseconds) override {
            before_({"time", path_, ""});
            file_->setModified(nanoseconds);
        }

        void flush() override { before_({"flush", path_, ""}); }

        void sync() override { before_({"fsync", path_, ""}); }

      private:
        const std::string path_;
        const std::unique_ptr<VolumeFile> file_;
        const Before& before_;
    };

    [[nodiscard]] static std::string path(Directory directory, const std::string& name) {
        switch (directory) {
        case Directory::Music:
            return "Music/" + name;
        case Directory::Own:
            return ".quorl/" + name;
        case Directory::Top:
            break;
        }
        return "/" + name;
    }

    [[nodiscard]] std::unique_ptr<VolumeFile> observed(std::string path,
                                                       std::unique_ptr<VolumeFile> file) const {
        return std::make_unique<File>(std::move(path), std::move(file), before_);
    }

    const std::unique_ptr<Volume> volume_;
    const Before before_;
};

} // namespace quorl::syncd::testing
