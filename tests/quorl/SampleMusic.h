#pragma once

#include "tests/base/TemporaryDirectory.h"

namespace quorl::tests {

/// A music folder with two playlists, "Long Run" of three songs and "Road Trip" of one, a generated
/// mix "Morning Mix", and a song that a playlist names and that is not there. It is the one that is
/// chosen in this session.
class SampleMusic {
  public:
    SampleMusic();

    [[nodiscard]] const TemporaryDirectory& folder() const { return folder_; }

    [[nodiscard]] std::string path() const { return folder_.path().string(); }

    /// Adds a playlist of one song.
    void addPlaylist(const std::string& name) const;

  private:
    TemporaryDirectory folder_;
};

} // namespace quorl::tests
