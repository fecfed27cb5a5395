#include "quorl-syncd/daemon/SharedChoices.h"

namespace quorl::syncd {

using namespace preferences;

Choices SharedChoices::read() {
    Choices choices{preferences_.get(assetSyncEnabled),
                    preferences_.get(assetSyncPlaylistPersistentID),
                    preferences_.get(assetSyncLimitType),
                    preferences_.get(assetSyncLimit).value_or(0),
                    {}};
    const auto playlist = preferences_.get(lastFullySentAssetSyncPlaylistPersistentID);
    const auto revision = preferences_.get(lastFullySentAssetSyncPlaylistVersion);
    if (playlist && revision) {
        choices.lastSent = SentPlaylist{*playlist, *revision};
    }
    return choices;
}

std::string SharedChoices::rememberSent(const SentPlaylist& sent) {
    const auto playlist =
        preferences_.set(lastFullySentAssetSyncPlaylistPersistentID, sent.playlist);
    return playlist.problem.empty()
               ? preferences_.set(lastFullySentAssetSyncPlaylistVersion, sent.revision).problem
               : playlist.problem;
}

std::string SharedChoices::forgetSent() {
    const auto revision = preferences_.set(lastFullySentAssetSyncPlaylistVersion, {});
    return revision.problem.empty()
               ? preferences_.set(lastFullySentAssetSyncPlaylistPersistentID, {}).problem
               : revision.problem;
}

std::string SharedChoices::switchOff() { return preferences_.set(assetSyncEnabled, false).problem; }

} // namespace quorl::syncd
