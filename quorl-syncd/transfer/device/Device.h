#pragma once

#include <array>
#include <cstdint>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "quorl-syncd/transfer/device/UnfinishedFile.h"
#include "quorl-syncd/transfer/device/Volume.h"
#include "services/wearable/Generations.h"

namespace quorl::syncd {

/// A wearable, open for one sync, which nobody else can open meanwhile. The only way in which a
/// sync touches it. One thread.
///
/// There are two directories: the music directory, in which there may be files of others and
/// unfinished ones of ours, and one of our own, which holds the manifest. Nothing is ever renamed
/// over anything. Every failure throws `std::system_error`, unless another one is named; the errors
/// that have a message of their own are in `messageOf`.
///
/// On FAT a loss of power may leave a file without its name, or a name without its file; within a
/// rename, both names or none; and a name only tells where its file is once the file was made
/// durable under it. So a file counts only after `settle`.
///
/// Where something could not be made durable, the system takes it for durable from then on, whoever
/// wrote it. So what an earlier sync may have left unsettled is given up with what this one has not
/// settled; and a list is only ever valid under a name that is durable.
class Device {
  public:
    /// Makes the directories that we need.
    explicit Device(std::unique_ptr<Volume> volume);

    /// Empty where there is none. To be called before the first `saveManifest`. Throws
    /// `wearable::BadManifest` where it cannot be used.
    [[nodiscard]] wearable::Manifest loadManifest();

    /// Puts it in the place of the old one, and returns once it outlives a loss of power, as does
    /// everything that earlier syncs have done. At every moment one of the two can be read. A save
    /// that failed leaves open which of them it is, until the next one.
    void saveManifest(const wearable::Manifest& manifest);

    /// What may still be written, in bytes.
    [[nodiscard]] std::uint64_t available() { return volume_->available(); }

    /// Of everything in the music directory, whoever put it there.
    [[nodiscard]] std::vector<std::string> musicNames();

    /// The regular file of this name in the music directory; nothing where there is none.
    [[nodiscard]] std::optional<base::FileState> find(const std::string& name);

    /// Opens a file of the music directory. Reading throws `std::system_error`.
    [[nodiscard]] std::unique_ptr<base::Reader> openMusic(const std::string& name);

    /// Removes a file of the music directory; one that is gone already is no failure. Only outlives
    /// a loss of power after `settle`.
    void removeMusic(const std::string& name);

    /// Whether a file in the music directory is one that `createUnfinished` has made, in this sync
    /// or in an earlier one.
    [[nodiscard]] static bool isUnfinished(std::string_view name);

    /// Makes an empty file in the music directory.
    [[nodiscard]] UnfinishedFile createUnfinished();

    /// Gives a file that is complete and settled its name. False: there is something of that name
    /// already, and the file is as it was. Only counts after `settle`.
    [[nodiscard]] bool finish(const UnfinishedFile& file, const std::string& name);

    /// Names in the music directory that an earlier sync may have given or taken away without
    /// having settled that.
    /// @param given to files of ours.
    /// @param taken that no file has.
    void mayBeUnsettled(const std::vector<std::string>& given,
                        const std::vector<std::string>& taken);

    /// Waits until all that was written, finished and removed outlives a loss of power. Where it
    /// fails, nothing of that since the last time may be trusted; `discardUnsettled` is due.
    void settle();

    /// Whether all that earlier syncs have left is settled, or given up.
    [[nodiscard]] bool isPastDurable() const { return isPastDurable_; }

    /// Removes an unfinished file.
    void discard(const UnfinishedFile& file);

    /// Removes all that was created and not settled. Where something could not be made durable,
    /// also removes once more what was removed and not settled, settles that, and writes the list
    /// again where that was not durable yet.
    void discardUnsettled();

  private:
    [[nodiscard]] bool makeOwn();
    void syncTop(const std::vector<Volume::Directory>& made);
    [[nodiscard]] std::unique_ptr<base::Reader> openOwn(const std::string& name);
    void makeDirectories();
    void writeGeneration(std::size_t index, const wearable::Manifest& manifest);
    [[nodiscard]] std::unique_ptr<VolumeFile> openGeneration(std::size_t index);
    void writeNewestAgain();
    void removeIfThere(Volume::Directory directory, const std::string& name);
    void removeOnceMore(const std::string& name);

    const std::unique_ptr<Volume> volume_;

    std::uint64_t generation_ = 0;
    std::size_t nextFile_ = 0;
    /// Whether this sync has made the file of the list, and its name durable.
    std::array<bool, wearable::generationFiles.size()> isOurs_{};

    bool isPastDurable_ = false;
    /// Nor will it be before it is written again.
    bool isPastLost_ = false;
    /// Something could not be made durable, and what was not settled then was not given up yet.
    bool isUnsure_ = false;

    /// Files in the music directory, by their present names.
    std::set<std::string> unsettled_;
    /// Names there that were taken away and not settled.
    std::set<std::string> removed_;
    /// For the next unfinished file.
    int number_ = 1;
};

} // namespace quorl::syncd
