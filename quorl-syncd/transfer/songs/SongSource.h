#pragma once

#include <filesystem>
#include <memory>
#include <string>

#include "quorl-syncd/transfer/songs/SongProblem.h"
#include "services/base/FileStatus.h"
#include "services/base/Reader.h"

namespace quorl::syncd {

/// A song of the music folder, open for reading. Reading throws `SongProblem`.
class OpenSong : public base::Reader {
  public:
    /// Throws `SongProblem` where the song is no longer in the state that was expected.
    virtual void requireUnchanged() const = 0;

    /// The open file, for a device that can take over its contents without reading them; -1 where
    /// there is none. Belongs to the song.
    [[nodiscard]] virtual int descriptor() const { return -1; }
};

/// The only way in which a sync looks at songs of the music folder.
class SongSource {
  public:
    virtual ~SongSource() = default;

    /// Opens the song at `path` in the music folder `root`. Throws `SongProblem` where it is gone,
    /// cannot be read, or is not in the state that is expected. The song may outlive the source.
    [[nodiscard]] virtual std::unique_ptr<OpenSong> open(const std::filesystem::path& root,
                                                         const std::string& path,
                                                         const base::FileState& expected) = 0;
};

} // namespace quorl::syncd
