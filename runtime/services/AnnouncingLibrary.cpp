#include "runtime/services/AnnouncingLibrary.h"

#include <algorithm>

#include "runtime/host/Host.h"

// The trace and the messages of hosts name a property by its constant, so that is its value too.
const MPMediaProperty MPMediaPlaylistPropertyPersistentID = "MPMediaPlaylistPropertyPersistentID";
const MPMediaProperty MPMediaPlaylistPropertyIsFolder = "MPMediaPlaylistPropertyIsFolder";
const MPMediaProperty MPMediaPlaylistPropertyIsAugurMix = "MPMediaPlaylistPropertyIsAugurMix";
const MPMediaProperty MPMediaPlaylistPropertyIsAugurPlaylist =
    "MPMediaPlaylistPropertyIsAugurPlaylist";
const MPMediaProperty MPMediaEntityPropertyEntityRevision = "MPMediaEntityPropertyEntityRevision";
const MPMediaProperty MPMediaItemPropertyFileSize = "MPMediaItemPropertyFileSize";

namespace quorl {

void AnnouncingLibrary::beginGeneratingLibraryChangeNotifications() { ++wanted_; }

void AnnouncingLibrary::endGeneratingLibraryChangeNotifications() {
    if (wanted_ > 0) {
        --wanted_;
    }
}

void AnnouncingLibrary::contentsDidChange() {
    if (wanted_ > 0) {
        NSNotificationCenter::defaultCenter().postNotificationName_object(
            MPMediaLibraryDidChangeNotification, this);
    }
}

bool fulfils(const MPMediaEntity& entity, const AnnouncingLibrary::Predicates& predicates) {
    return std::all_of(predicates.begin(), predicates.end(), [&entity](const auto& predicate) {
        const auto value = entity.valueForProperty(predicate->property());
        return value != nullptr && value->isEqual(predicate->value().get());
    });
}

} // namespace quorl

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
