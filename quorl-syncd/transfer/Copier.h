#pragma once

#include <cstddef>
#include <filesystem>
#include <functional>
#include <memory>
#include <span>
#include <stop_token>
#include <vector>

#include "quorl-syncd/transfer/CopyProgress.h"
#include "quorl-syncd/transfer/Ledger.h"
#include "quorl-syncd/transfer/Plan.h"
#include "quorl-syncd/transfer/SyncPorts.h"
#include "quorl-syncd/transfer/pace/CommitRule.h"

namespace quorl::syncd {

/// Copies songs to a device, and brings them onto it in groups. Once.
class Copier {
  public:
    using Told = std::function<void(const CopyProgress&)>;

    /// What a copier works with; all of it outlives the copier.
    struct Means {
        const SyncPorts& ports;
        Device& device;
        Ledger& ledger;
        /// The music folder.
        const std::filesystem::path& root;
        /// All that are there, or are to be.
        TakenNames& names;
        const std::stop_token& stop;
        const Told& told;
    };

    /// @param progress how far it has come by what is there already.
    Copier(const Means& means, CopyProgress progress);

    /// Copies those of `songs` that have no hash, under the names that they have, and gives them
    /// their hashes; where a name turns out to be taken, under another one. Those that cannot be
    /// copied are taken out of `songs`.
    ///
    /// Gives back what is the matter with each of these. Throws `Stopped`, when all that was copied
    /// is on the device, and what the device throws.
    [[nodiscard]] std::vector<engine::Message> copy(std::vector<wearable::Entry>& songs);

  private:
    /// A song whose copy is complete, but perhaps not on the device yet.
    struct Copied {
        wearable::Entry& song;
        wearable::Digest hash;
        UnfinishedFile file;
    };

    [[nodiscard]] std::vector<engine::Message> copyAll(std::span<wearable::Entry> songs);
    void copySong(wearable::Entry& song);
    [[nodiscard]] wearable::Digest fill(UnfinishedFile& destination, OpenSong& source,
                                        const wearable::Entry& song);
    [[nodiscard]] wearable::Digest copyContents(OpenSong& source, UnfinishedFile& destination,
                                                std::uint64_t size);
    void pieceWasCopied(std::uint64_t bytes, std::uint64_t mostBytes);
    void commit();
    void finish(Copied& copied);

    const Means means_;
    CopyProgress progress_;
    CommitRule rule_;
    std::vector<Copied> copied_;
    const std::unique_ptr<std::byte[]> memory_;
};

} // namespace quorl::syncd
