#pragma once

#include <optional>
#include <stop_token>
#include <string>
#include <vector>

#include "quorl-syncd/transfer/Copier.h"
#include "quorl-syncd/transfer/Ledger.h"
#include "quorl-syncd/transfer/Order.h"
#include "quorl-syncd/transfer/Outcome.h"
#include "quorl-syncd/transfer/Plan.h"
#include "quorl-syncd/transfer/SyncPorts.h"

namespace quorl::syncd {

/// Brings what is wished for onto a wearable.
///
/// Whenever it ends, also by SIGKILL or a loss of power: the list of our files on the wearable can
/// be read, every song that it names is complete, the playlist only names songs that are there, the
/// list only says that all was sent where all of it is durable, and no file that somebody else put
/// there has been changed or removed.
///
/// First the list no longer says that all was sent. Then the new songs are written, then the
/// playlist; then songs are removed that are no longer wished for, and last of all the list says
/// that all was sent. Where the new songs have no room beside the old ones, the playlist and the
/// old ones are removed before.
class Sync {
  public:
    /// Called first when it is known what is there already, then after each piece. Must not throw.
    using Told = Copier::Told;

    Sync(Order order, SyncPorts ports, std::stop_token stop, Told told);

    /// Does all of it, on the calling thread; once. Never throws.
    [[nodiscard]] Outcome run();

  private:
    void perform(Device& device);
    void cleanUp(Device& device);

    void takeStock(Device& device);
    void requireRoom(Device& device);
    void settlePast(Device& device);
    [[nodiscard]] std::optional<wearable::Selection> claim() const;
    [[nodiscard]] bool isDone() const;
    void beginChanges(Device& device);
    [[nodiscard]] bool removesSongsFirst() const;
    void announce();
    void copySongs(Device& device);
    void bringPlaylist(Device& device);
    void writePlaylist(Device& device, wearable::Entry& playlist);
    void putPlaylist(Device& device, wearable::Entry& playlist, const UnfinishedFile& file);
    void removePlaylist(Device& device);
    void removeStrays(Device& device);
    void keepOnlyWhatIsWished(Device& device);

    [[nodiscard]] Hashes hashes(Device& device) const;
    [[nodiscard]] std::optional<wearable::Digest> hashOfCopy(Device& device,
                                                             const std::string& name) const;
    [[nodiscard]] Outcome outcome() const;

    const Order order_;
    const SyncPorts ports_;
    const std::stop_token stop_;
    const Told told_;

    /// Nothing before the device's list was read.
    std::optional<Ledger> ledger_;
    /// Names that the device's list has, and no file.
    std::vector<std::string> missing_;
    Plan plan_;
    /// Unfinished files of earlier syncs, which may be removed.
    Files leftovers_;
    Room room_ = Room::Enough;
};

} // namespace quorl::syncd
