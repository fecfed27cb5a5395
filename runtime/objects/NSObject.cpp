#include "platform/NSObject.h"

#include <algorithm>
#include <vector>

struct NSObject::AssociatedObjects {
    struct Associated {
        const void* key;
        std::shared_ptr<NSObject> value;
    };

    std::vector<Associated> all; ///< of which an object has one or two

    [[nodiscard]] auto placeOf(const void* key) {
        return std::ranges::find(all, key, &Associated::key);
    }
};

NSObject::NSObject() = default;

NSObject::~NSObject() = default;

bool NSObject::init() { return true; }

bool NSObject::isEqual(const NSObject* other) const { return this == other; }

std::shared_ptr<NSObject> objc_getAssociatedObject(const NSObject& object, const void* key) {
    if (!object._associatedObjects) {
        return nullptr;
    }
    auto& associated = *object._associatedObjects;
    const auto found = associated.placeOf(key);
    return found == associated.all.end() ? nullptr : found->value;
}

void objc_setAssociatedObject(NSObject& object, const void* key, std::shared_ptr<NSObject> value,
                              NSAssociationPolicy /*policy*/) {
    if (!object._associatedObjects) {
        object._associatedObjects = std::make_unique<NSObject::AssociatedObjects>();
    }
    auto& associated = *object._associatedObjects;
    const auto found = associated.placeOf(key);
    if (found == associated.all.end()) {
        associated.all.push_back({key, std::move(value)});
    } else {
        std::swap(found->value, value); // the old one is let go of last: it may come back here
    }
}
