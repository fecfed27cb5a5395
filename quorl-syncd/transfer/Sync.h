#pragma once

#include <chrono>
#include <functional>
#include <stop_token>
#include <string>
#include <vector>

#include "quorl-syncd/transfer/device/Device.h"
#include "quorl-syncd/transfer/Order.h"
#include "quorl-syncd/transfer/SongSource.h"

namespace quorl::syncd {

class RateLimit;

/// How far the copying has come. Songs and bytes that were already on the wearable are not counted.
struct CopyProgress {
    std::uint64_t songs = 0;
    std::uint64_t totalSongs = 0;
    std::uint64_t bytes = 0;
    std::uint64_t totalBytes = 0;
};

/// What became of a sync.
struct Outcome {
    enum class Kind {
        Sent,    ///< Everything that was wished for is on the wearable, also after a loss of power.
        Failed,  ///< Not everything; what was there before is still there.
        Stopped, ///< As `Failed`, because it was asked to.
    };

    Kind kind = Kind::Failed;
    /// For the user, in a sentence or several.
    std::string message;
    /// The music folder is no longer as the order has it.
    bool isLibraryStale = false;
    /// What was in the way may go away by itself.
    bool mayPass = false;
};

/// Brings what is wished for onto a wearable.
///
/// Whenever it ends, also by SIGKILL or a loss of power: the list of our files on the wearable can
/// be read, every song that it names is complete, and no file that somebody else put there has been
/// changed or removed. First the new songs are written, then the playlist, then the list; only then
/// are songs removed that are no longer wished for.
class Sync {
  public:
    /// Called first when it is known what there is to copy, then after each piece. Must not throw.
    using Told = std::function<void(const CopyProgress&)>;

    /// `rate` outlives the sync.
    Sync(Order order, RateLimit& rate, std::stop_token stop, Told told);

    /// Does all of it, on the calling thread; once. Never throws.
    [[nodiscard]] Outcome run();

  private:
    /// A song that is to be on the wearable. Without a hash it is not there yet.
    using Song = wearable::Entry;

    /// A song whose copy is complete, but perhaps not on the device yet.
    struct Copied {
        Song* song;
        std::string unfinished;
        base::FileDescriptor file;
    };

    void perform(Device& device);

    void takeStock(Device& device);
    void findWhatIsThere(Device& device);
    bool adopt(Song& song, const wearable::Entry& there);
    bool adoptStray(const Device& device, Song& song, const wearable::Entry& stray);
    void removeStrays(Device& device);
    void chooseNames(const Device& device);
    void requireSpace(const Device& device);

    void copySongs(Device& device);
    void copySong(Device& device, Song& song);
    void settle(Device& device);
    void leaveOut(const SongProblem& problem);

    [[nodiscard]] std::string playlistText() const;
    void writePlaylist(Device& device);
    void removeOldSongs(Device& device);
    void remember(Device& device);

    [[nodiscard]] Outcome outcome() const;

    Order order_;
    RateLimit& rate_;
    std::stop_token stop_;
    Told told_;

    /// Says at every moment what of ours is on the device, or about to be.
    wearable::Manifest manifest_;
    /// As it was when it was last read or written.
    wearable::Manifest saved_;
    /// In the order of the playlist, each once.
    std::vector<Song> songs_;
    wearable::Entry playlist_;
    std::vector<Copied> copied_;
    std::chrono::steady_clock::time_point settled_;
    std::uint64_t unsettledBytes_ = 0;
    std::uint64_t unsettledLimit_ = std::uint64_t{64} << 20;
    CopyProgress progress_;
    /// Sentences about songs that are not sent.
    std::vector<std::string> problems_;
};

} // namespace quorl::syncd
