#include <cstdlib>
#include <limits>
#include <string>
#include <unordered_map>

#include <cxxabi.h>

#include "platform/Foundation.h"

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
                              std::uintptr_t /*policy*/) {
    if (!object._associatedObjects) {
        object._associatedObjects = std::make_unique<NSObject::AssociatedObjects>();
    }
    // The old value is let go of last: its destructor may come back here.
    std::swap(object._associatedObjects->byKey[key], value);
}

std::string Class::name() const {
    int status = 0;
    const std::unique_ptr<char, decltype(&std::free)> demangled(
        abi::__cxa_demangle(_type->name(), nullptr, nullptr, &status), &std::free);
    return status == 0 ? demangled.get() : _type->name();
}

std::shared_ptr<NSObject> Class::create() const { return _factory ? _factory() : nullptr; }

template <class Unsigned>
Unsigned NSSaturatingTruncate(double value) {
    constexpr auto largest = std::numeric_limits<Unsigned>::max();
    if (!(value > 0)) {
        return 0;
    }
    // The largest value itself may round up on its way to double, so that it cannot be compared
    // with.
    return value < static_cast<double>(largest) ? static_cast<Unsigned>(value) : largest;
}

template std::uint32_t NSSaturatingTruncate<std::uint32_t>(double);
template std::uint64_t NSSaturatingTruncate<std::uint64_t>(double);
