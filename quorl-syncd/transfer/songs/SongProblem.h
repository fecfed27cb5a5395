#pragma once

#include <stdexcept>
#include <string>

#include "services/engine/Message.h"

namespace quorl::syncd {

/// Why a song of the music folder cannot be sent as it is.
enum class SongTrouble {
    Gone,
    Unreadable,
    NotAFile,
    Changed,
    TooLarge, ///< for the file system of the device
};

/// One song cannot be sent; the others can. The text is a sentence for the user.
class SongProblem : public std::runtime_error {
  public:
    /// @param song its path in the music folder; any bytes.
    /// @param detail what the system says, for `Unreadable`.
    SongProblem(SongTrouble trouble, const std::string& song, const std::string& detail = {});

    /// Its first argument is the path of the song.
    [[nodiscard]] const engine::Message& message() const { return message_; }

  private:
    explicit SongProblem(engine::Message message);

    engine::Message message_;
};

} // namespace quorl::syncd
