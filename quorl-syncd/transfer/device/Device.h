#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "quorl-syncd/transfer/Reader.h"
#include "services/base/FileStatus.h"
#include "services/wearable/Manifest.h"

namespace quorl::syncd {

/// A file on the device that is not in the music directory yet, open for writing. Every failure
/// throws `std::system_error`. The file stays behind, incomplete, when this is destroyed.
class UnfinishedFile {
  public:
    virtual ~UnfinishedFile() = default;

    /// Has the empty file share the contents of an open file of this machine, so that nothing has
    /// to be written. False: the device cannot, and the file is as it was.
    [[nodiscard]] virtual bool share(int descriptor) = 0;

    /// Appends. What is written need not be on the device before `sync`.
    virtual void write(std::span<const std::byte> bytes) = 0;

    /// Nothing more is written. Gives the file its modification time, in nanoseconds since 1970,
    /// where the device keeps any, and has the device begin with what it still holds back.
    virtual void complete(std::int64_t modified) = 0;

    /// Waits until the contents outlive a loss of power. Whether the file is there then, and under
    /// which name, is the matter of `Device::finish` and `Device::syncMusic`.
    virtual void sync() = 0;
};

/// A wearable, open for one sync, which nobody else can open meanwhile. The only way in which a
/// sync touches it. One thread.
///
/// There are two directories: the music directory, in which there may be files of others, and one
/// of our own, which holds the manifest and unfinished files. Every failure throws
/// `std::system_error`, unless another one is named; the errors that have a sentence of their own
/// are in `troubleOf`.
class Device {
  public:
    /// What to do where there is a file of the new name already.
    enum class IfThere { Fail, Replace };

    virtual ~Device() = default;

    /// Empty where there is none. Throws `wearable::BadManifest` where it cannot be understood.
    [[nodiscard]] virtual wearable::Manifest loadManifest() = 0;

    /// Puts it in the place of the old one, and returns once it outlives a loss of power. At every
    /// moment there is one of the two, as a whole.
    virtual void saveManifest(const wearable::Manifest& manifest) = 0;

    /// What may still be written, in bytes.
    [[nodiscard]] virtual std::uint64_t available() = 0;

    /// Of everything in the music directory, whoever put it there.
    [[nodiscard]] virtual std::vector<std::string> musicNames() = 0;

    /// The regular file of this name in the music directory; nothing where there is none.
    [[nodiscard]] virtual std::optional<base::FileState> find(const std::string& name) = 0;

    /// Opens a file of the music directory. Reading throws `std::system_error`.
    [[nodiscard]] virtual std::unique_ptr<Reader> openMusic(const std::string& name) = 0;

    /// Removes a file of the music directory; one that is gone already is no failure. Only outlives
    /// a loss of power after `syncMusic`.
    virtual void removeMusic(const std::string& name) = 0;

    /// Makes an empty file in our own directory, or empties the one of that name.
    [[nodiscard]] virtual std::unique_ptr<UnfinishedFile>
    createUnfinished(const std::string& name) = 0;

    /// Moves a file that is complete into the music directory, at once and as a whole. With
    /// `IfThere::Fail` throws `EEXIST` where there is a file of that name. Only outlives a loss of
    /// power after `syncMusic`.
    virtual void finish(const std::string& unfinished, const std::string& name,
                        IfThere ifThere) = 0;

    /// Removes all that `createUnfinished` has made and `finish` has not moved, in this sync and in
    /// earlier ones.
    virtual void removeUnfinished() = 0;

    /// Waits until the names in the music directory outlive a loss of power.
    virtual void syncMusic() = 0;
};

} // namespace quorl::syncd
