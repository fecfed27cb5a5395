#include "sync/LMSyncDefaults+Extras.h"
#include "sync/_LMSyncDefaultsAssociatedObject.h"

namespace {

/// Its address is the key: unique in the process, with no storage of its own. The object is owned
/// by `defaults`.
_LMSyncDefaultsAssociatedObject& _associatedObject(LMSyncDefaults& defaults) {
    const auto* key = reinterpret_cast<const void*>(&_associatedObject);
    if (const auto attached = objc_getAssociatedObject(defaults, key)) {
        return static_cast<_LMSyncDefaultsAssociatedObject&>(*attached);
    }
    const auto object = create<_LMSyncDefaultsAssociatedObject>();
    objc_setAssociatedObject(defaults, key, object, OBJC_ASSOCIATION_RETAIN_NONATOMIC);
    return *object;
}

} // namespace

std::shared_ptr<MPMediaPlaylist> assetSyncPlaylist(LMSyncDefaults& defaults) {
    if (!defaults.isAssetSyncEnabled()) {
        return nullptr;
    }
    const auto persistentID = defaults.assetSyncPlaylistPersistentID();
    if (!persistentID) {
        return nullptr;
    }
    auto& cache = _associatedObject(defaults);
    const auto& cached = cache.assetSyncPlaylist();
    if (cached && cached->persistentID() == persistentID->unsignedLongLongValue()) {
        return cached;
    }
    const auto query = MPMediaQuery::playlistsQuery();
    query->addFilterPredicate(MPMediaPropertyPredicate::predicateWithValue_forProperty(
        persistentID, MPMediaPlaylistPropertyPersistentID));
    const auto collections = query->collections();
    const auto found = elements<MPMediaPlaylist>(collections);
    cache.setAssetSyncPlaylist(found.empty() ? nullptr : found.front());
    return cache.assetSyncPlaylist();
}

void setAssetSyncPlaylist(LMSyncDefaults& defaults,
                          const std::shared_ptr<MPMediaPlaylist>& playlist) {
    // The cache first: whoever reads after the write finds it filled, and runs no query.
    _associatedObject(defaults).setAssetSyncPlaylist(playlist);
    defaults.setAssetSyncPlaylistPersistentID(
        playlist ? NSNumber::numberWithUnsignedLongLong(playlist->persistentID()) : nullptr);
}
