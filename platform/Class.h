#pragma once

#include <memory>
#include <string>
#include <typeinfo>

#include "platform/NSObject.h"

/// A class as a value.
class Class {
  public:
    template <std::derived_from<NSObject> T>
    [[nodiscard]] static Class of() {
        return Class(typeid(T), [] { return std::static_pointer_cast<NSObject>(::create<T>()); });
    }

    /// The class that `object` was made as. It cannot make another one: `create` gives null.
    [[nodiscard]] static Class ofObject(const NSObject& object) {
        return {typeid(object), nullptr};
    }

    /// The name as declared, for instance "LMQuorlPlaylistChooser".
    [[nodiscard]] std::string name() const;

    /// A new object of this class, made by its `init`, or null when that failed.
    [[nodiscard]] std::shared_ptr<NSObject> create() const;

    [[nodiscard]] const std::type_info& type() const { return *_type; }

    [[nodiscard]] bool operator==(const Class& other) const { return *_type == *other._type; }

  private:
    using Factory = std::shared_ptr<NSObject> (*)();

    Class(const std::type_info& type, Factory factory) : _type(&type), _factory(factory) {}

    const std::type_info* _type;
    Factory _factory;
};

/// How a plug-in offers a class to hosts, by name: one exported constant for each such class, named
/// `QuorlClass_` and the class's name.
#define QUORL_EXPORT_CLASS(name)                                                                   \
    extern "C" {                                                                                   \
    __attribute__((visibility("default"))) extern const Class QuorlClass_##name;                   \
    const Class QuorlClass_##name = Class::of<name>();                                             \
    }
