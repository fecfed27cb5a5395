#include "sync/_LMSyncDefaultsAssociatedObject.h"

using Self = _LMSyncDefaultsAssociatedObject;

bool Self::init() {
    if (!NSObject::init()) {
        return false;
    }
    NSNotificationCenter::defaultCenter().addObserver_selector_name_object(
        this,
        NSNotificationSelector::of<&Self::_mediaLibraryDidChangeNotification>(
            "_mediaLibraryDidChangeNotification:"),
        MPMediaLibraryDidChangeNotification, nullptr);
    return true;
}

Self::~_LMSyncDefaultsAssociatedObject() {
    NSNotificationCenter::defaultCenter().removeObserver(this);
}

void Self::_mediaLibraryDidChangeNotification(const NSNotification& /*notification*/) {
    _assetSyncPlaylist = nullptr;
}
