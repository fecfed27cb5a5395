#include "platform/MediaLibrary.h"

#include "runtime/host/Host.h"
#include "runtime/services/AnnouncingLibrary.h"

// The trace and the messages of hosts name a property by its constant, so that is its value too.
const MPMediaProperty MPMediaPlaylistPropertyPersistentID = "MPMediaPlaylistPropertyPersistentID";
const MPMediaProperty MPMediaPlaylistPropertyIsFolder = "MPMediaPlaylistPropertyIsFolder";
const MPMediaProperty MPMediaPlaylistPropertyIsAugurMix = "MPMediaPlaylistPropertyIsAugurMix";
const MPMediaProperty MPMediaPlaylistPropertyIsAugurPlaylist =
    "MPMediaPlaylistPropertyIsAugurPlaylist";
const MPMediaProperty MPMediaEntityPropertyEntityRevision = "MPMediaEntityPropertyEntityRevision";
const MPMediaProperty MPMediaItemPropertyFileSize = "MPMediaItemPropertyFileSize";
const NSNotificationName MPMediaLibraryDidChangeNotification =
    "MPMediaLibraryDidChangeNotification";

MPMediaLibrary& MPMediaLibrary::defaultMediaLibrary() {
    return quorl::Host::required().mediaLibrary();
}

std::shared_ptr<MPMediaPropertyPredicate>
MPMediaPropertyPredicate::predicateWithValue_forProperty(std::shared_ptr<NSNumber> value,
                                                         MPMediaProperty property) {
    return predicateWithValue_forProperty_comparisonType(std::move(value), property,
                                                         MPMediaPredicateComparison::EqualTo);
}

std::shared_ptr<MPMediaPropertyPredicate>
MPMediaPropertyPredicate::predicateWithValue_forProperty_comparisonType(
    std::shared_ptr<NSNumber> value, MPMediaProperty property,
    MPMediaPredicateComparison comparisonType) {
    return std::make_shared<MPMediaPropertyPredicate>(std::move(value), property, comparisonType);
}

std::shared_ptr<MPMediaQuery> MPMediaQuery::playlistsQuery() { return create<MPMediaQuery>(); }

void MPMediaQuery::addFilterPredicate(std::shared_ptr<MPMediaPropertyPredicate> predicate) {
    _predicates.push_back(std::move(predicate));
}

NSArray<MPMediaPlaylist> MPMediaQuery::collections() const {
    return quorl::Host::required().mediaLibrary().playlistsMatching(_predicates);
}
