#pragma once

#include <ctime>
#include <map>
#include <string>
#include <vector>

#include "quorl-syncd/transfer/Sync.h"
#include "services/preferences/Preference.h"
#include "tests/base/TemporaryDirectory.h"

/// A music folder and a wearable, both real directories.
namespace quorl::syncd::testing {

using tests::TemporaryDirectory;

/// File names and contents.
using Contents = std::map<std::string, std::string>;

/// Of all files in `directory` and below.
[[nodiscard]] Contents contentsOf(const std::filesystem::path& directory);

[[nodiscard]] std::string textOf(const std::filesystem::path& file);

/// A music folder with one playlist, "List".
class Music {
  public:
    [[nodiscard]] const std::filesystem::path& path() const { return folder_.path(); }

    /// Writes a song, and sets its time so that each write makes a difference.
    void write(const std::string& name, const std::string& text);

    /// Sets the time of a song, in seconds since 1970; gives back the one that the file system has
    /// made of it.
    [[nodiscard]] std::time_t setTime(const std::string& name, std::time_t seconds) const;

    void remove(const std::string& name) const;

    /// Makes a link to a song or to anything else.
    void link(const std::string& name, const std::filesystem::path& target) const {
        folder_.link(name, target);
    }

    /// Writes the playlist `title`, which lists the songs in this order.
    void list(const std::vector<std::string>& songs, const std::string& title = "List");

  private:
    TemporaryDirectory folder_;
    int writes_ = 0;
};

/// A wearable, and what was put there by others.
class Player {
  public:
    explicit Player(std::optional<std::uint64_t> capacity = std::uint64_t{1} << 30)
        : wearable_{folder_.path(), capacity, false} {}

    [[nodiscard]] const wearable::Wearable& wearable() const { return wearable_; }

    [[nodiscard]] const std::filesystem::path& path() const { return folder_.path(); }

    /// The files in the music directory.
    [[nodiscard]] Contents music() const { return contentsOf(path() / wearable::musicDirectory); }

    [[nodiscard]] wearable::Manifest manifest() const;

    void write(const std::string& name, const std::string& text) { folder_.write(name, text); }

  private:
    TemporaryDirectory folder_;
    wearable::Wearable wearable_;
};

inline constexpr std::uint64_t noLimit = 99;

/// The playlist "List" of the folder as it is now.
[[nodiscard]] Order wishFor(const Music& music, const Player& player,
                            std::uint64_t limitType = noLimit, std::uint64_t limit = 0,
                            const std::string& title = "List");

using OpenVolume = decltype(SyncPorts::openVolume);

[[nodiscard]] std::unique_ptr<Volume> openPosixVolume(const wearable::Wearable& wearable);

/// A whole sync; `told` sees each step.
[[nodiscard]] Outcome sync(const Order& order, const Sync::Told& told = {},
                           std::stop_token stop = {}, const OpenVolume& open = openPosixVolume);

/// What is to hold on a wearable at every moment: the list of our files can be read, and each song
/// that it names is there with the contents that it had. An empty text, or what is wrong.
[[nodiscard]] std::string whatIsWrongWith(const std::filesystem::path& wearable);

} // namespace quorl::syncd::testing
