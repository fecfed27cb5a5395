#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "services/base/FileStatus.h"
#include "services/base/Reader.h"

namespace quorl::syncd {

/// A file of a volume, open for writing. Every failure throws `std::system_error`.
class VolumeFile {
  public:
    virtual ~VolumeFile() = default;

    /// Has the empty file share the contents of an open file of this machine, so that nothing has
    /// to be written. False: the volume cannot, and the file is as it was.
    [[nodiscard]] virtual bool share(int descriptor) = 0;

    /// Appends.
    virtual void write(std::span<const std::byte> bytes) = 0;

    /// In nanoseconds since 1970. A volume that keeps no times leaves it out.
    virtual void setModified(std::int64_t nanoseconds) = 0;

    /// Has the volume begin with what it still holds back, and does not wait.
    virtual void flush() = 0;

    /// Returns once the contents outlive a loss of power. The name is the matter of
    /// `Volume::syncDirectory`, and on FAT of `Volume::sync` after the last rename.
    virtual void sync() = 0;
};

/// The file system of a wearable, by its single operations, so that each can fail and power can be
/// lost between any two of them. What was written is only promised to outlive a loss of power where
/// an operation says so. Every failure throws `std::system_error`. One thread.
class Volume {
  public:
    enum class Directory {
        Top,
        Music, ///< where the songs and the playlist are, and files of others
        Own,   ///< where we keep what we need to know about the wearable
    };

    virtual ~Volume() = default;

    /// Makes `Music` or `Own` where it is not there. True: it was made.
    virtual bool makeDirectory(Directory directory) = 0;

    /// Removes a directory that was made just now and is empty. To be opened anew after that.
    virtual void removeDirectory(Directory directory) = 0;

    /// Of everything in the directory, whoever put it there.
    [[nodiscard]] virtual std::vector<std::string> names(Directory directory) = 0;

    /// The regular file of this name, also under another spelling where the volume knows no
    /// difference; nothing where there is none.
    [[nodiscard]] virtual std::optional<base::FileState> find(Directory directory,
                                                              const std::string& name) = 0;

    /// Opens a regular file. Never waits for a pipe. Reading throws `std::system_error`.
    [[nodiscard]] virtual std::unique_ptr<base::Reader> open(Directory directory,
                                                             const std::string& name) = 0;

    /// Makes an empty file, for its owner alone to write. Throws `EEXIST` where there is anything
    /// of that name.
    [[nodiscard]] virtual std::unique_ptr<VolumeFile> create(Directory directory,
                                                             const std::string& name) = 0;

    /// Opens a regular file that is there, to be written over from its beginning. It keeps its
    /// size where less is written: on FAT a file that a loss of power has left with the space that
    /// it gave back cannot be used any more.
    [[nodiscard]] virtual std::unique_ptr<VolumeFile> overwrite(Directory directory,
                                                                const std::string& name) = 0;

    /// Gives a file another name in its directory. Throws `EEXIST` where there is anything of that
    /// name.
    virtual void rename(Directory directory, const std::string& name,
                        const std::string& newName) = 0;

    /// Throws `ENOENT` where there is no such file.
    virtual void remove(Directory directory, const std::string& name) = 0;

    /// Returns once the names in the directory outlive a loss of power.
    virtual void syncDirectory(Directory directory) = 0;

    /// Returns once everything that was written to the volume outlives a loss of power. On FAT a
    /// renamed file is only whole after that.
    virtual void sync() = 0;

    /// What may still be written, in bytes.
    [[nodiscard]] virtual std::uint64_t available() = 0;
};

} // namespace quorl::syncd
