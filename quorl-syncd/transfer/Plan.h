#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "quorl-syncd/transfer/CopyProgress.h"
#include "quorl-syncd/transfer/Order.h"
#include "quorl-syncd/transfer/device/DeviceNames.h"
#include "services/base/FileStatus.h"
#include "services/engine/Message.h"
#include "services/wearable/Manifest.h"

/// What is to be done to a device, worked out from plain values.
namespace quorl::syncd {

/// Contents that have to be compared where names, sizes and times do not tell enough. What they
/// throw ends the planning, but for `SongProblem`, which leaves out the song.
struct Hashes {
    /// Of a song of the music folder.
    std::function<wearable::Digest(const wearable::Entry& song)> ofSong;
    /// Of the file of this name in the device's music directory; nothing where it is gone.
    std::function<std::optional<wearable::Digest>(const std::string& name)> ofCopy;
};

/// Regular files of a music directory, by name.
using Files = std::map<std::string, base::FileState>;

/// Whether a file is the one that an entry says, and not one of somebody else that took its name:
/// by size and time, and where the time differs, by its contents. An empty file has none: it is
/// what a loss of power has left of ours.
/// @param file the one of this name; nothing where there is none.
[[nodiscard]] bool isOurs(const wearable::Entry& entry, const std::optional<base::FileState>& file,
                          const Hashes& hashes);

/// As `isOurs`, for a playlist, by its contents in any case.
[[nodiscard]] bool isOurPlaylist(const wearable::Entry& playlist,
                                 const std::optional<base::FileState>& file, const Hashes& hashes);

/// Looks for a regular file in a music directory, by name; nothing where there is none.
using FindFile = std::function<std::optional<base::FileState>(const std::string& name)>;

/// Leaves the part of `manifest` that is true of a device. Whether there was another.
[[nodiscard]] bool forgetWhatIsNotThere(wearable::Manifest& manifest, const FindFile& find,
                                        const Hashes& hashes);

/// What an order asks for on a certain device.
struct Plan {
    /// The songs that are to be there, in the order of the playlist, each once. Those without a
    /// hash are not there yet, and to be copied under these names.
    std::vector<wearable::Entry> songs;
    /// Those of `songs` that an earlier sync has left behind, complete.
    std::vector<wearable::Entry> adopted;
    /// Files that an earlier sync has left behind and that are of no use.
    std::vector<wearable::Entry> useless;
    /// Songs that are there and will not be, in the end.
    std::vector<wearable::Entry> unwanted;
    /// The playlist as it will be if all songs can be copied; nothing where none is to be there.
    std::optional<wearable::Entry> playlist;
    /// All names that are there, or are to be; none where nothing is to get a name.
    TakenNames names;
    /// Of all songs; those that are there already are done.
    CopyProgress progress;
    std::uint64_t bytesToCopy = 0;
    /// One for each song that cannot be sent.
    std::vector<engine::Message> problems;
};

/// @param there as `forgetWhatIsNotThere` has left it.
/// @param names of all that is in the device's music directory, whoever put it there.
[[nodiscard]] Plan planOf(const Order& order, const wearable::Manifest& there,
                          const std::vector<std::string>& names, const Hashes& hashes);

/// Takes a name for the copy of a song that no file on the device has.
[[nodiscard]] std::string takeName(TakenNames& names, const wearable::Entry& song);

/// The same for a playlist of this title.
[[nodiscard]] std::string takePlaylistName(TakenNames& names, std::string_view title);

/// Whether new songs find room beside the old ones.
enum class Room { Enough, EnoughWithoutUnwanted, NotEnough };

/// @param available in bytes, once everything useless is gone.
[[nodiscard]] Room roomFor(const Plan& plan, std::uint64_t available);

/// Which of the unfinished files that earlier syncs have left behind may be removed: on FAT, what
/// has the size and time of a finished one may be a second name of that, and both share what one of
/// them would give away.
/// @param finished whoever's they are: a hand may have changed one of ours since.
[[nodiscard]] Files removable(Files unfinished, const Files& finished);

/// The playlist file of the order, with those of its songs that are among `songs`, under the names
/// that they have on the device.
[[nodiscard]] std::string playlistText(const Order& order,
                                       const std::vector<wearable::Entry>& songs);

} // namespace quorl::syncd
