#pragma once

#include "quorl-syncd/transfer/songs/SongSource.h"

namespace quorl::syncd {

/// The songs of a directory of this machine. Any thread.
class PosixSongSource final : public SongSource {
  public:
    [[nodiscard]] std::unique_ptr<OpenSong> open(const std::filesystem::path& root,
                                                 const std::string& path,
                                                 const base::FileState& expected) override;
};

} // namespace quorl::syncd
