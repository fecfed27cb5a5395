#include "platform/NSObject.h"

#include <unordered_map>

struct NSObject::AssociatedObjects {
    std::unordered_map<const void*, std::shared_ptr<NSObject>> byKey;
};

NSObject::NSObject() = default;

NSObject::~NSObject() = default;

bool NSObject::init() { return true; }

bool NSObject::isEqual(const NSObject* other) const { return this == other; }

std::shared_ptr<NSObject> objc_getAssociatedObject(const NSObject& object, const void* key) {
    if (!object._associatedObjects) {
        return nullptr;
    }
    const auto& byKey = object._associatedObjects->byKey;
    const auto found = byKey.find(key);
    return found == byKey.end() ? nullptr : found->second;
}

void objc_setAssociatedObject(NSObject& object, const void* key, std::shared_ptr<NSObject> value,
                              NSAssociationPolicy /*policy*/) {
    if (!object._associatedObjects) {
        object._associatedObjects = std::make_unique<NSObject::AssociatedObjects>();
    }
    // The old value is let go of last: its destructor may come back here.
    std::swap(object._associatedObjects->byKey[key], value);
}
