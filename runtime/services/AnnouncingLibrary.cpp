#include "runtime/services/AnnouncingLibrary.h"

#include <algorithm>

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
