#pragma once

#include <concepts>
#include <cstdint>
#include <memory>
#include <type_traits>
#include <utility>

/// How an object holds what is associated with it. There is one way: it owns it, not atomically.
using NSAssociationPolicy = std::integral_constant<std::uintptr_t, 1>;
inline constexpr NSAssociationPolicy OBJC_ASSOCIATION_RETAIN_NONATOMIC = {};

/// The base of every class of the platform and of its plug-ins.
///
/// Objects are made by `create`, which keeps construction in two steps: the constructor cannot
/// fail, the initialiser may. An object is always held by a `std::shared_ptr`, within its
/// initialiser too.
class NSObject : public std::enable_shared_from_this<NSObject> {
  public:
    NSObject();
    NSObject(const NSObject&) = delete;
    NSObject& operator=(const NSObject&) = delete;
    virtual ~NSObject();

    /// The second step of construction. An override calls its base class's `init` first and gives
    /// false back at once when that did; false means that there is no object.
    [[nodiscard]] virtual bool init();

    /// Whether both stand for the same value; for a class without values, whether they are the same
    /// object. A null `other` is equal to nothing.
    [[nodiscard]] virtual bool isEqual(const NSObject* other) const;

  private:
    struct AssociatedObjects;
    friend std::shared_ptr<NSObject> objc_getAssociatedObject(const NSObject&, const void*);
    friend void objc_setAssociatedObject(NSObject&, const void*, std::shared_ptr<NSObject>,
                                         NSAssociationPolicy);

    std::unique_ptr<AssociatedObjects> _associatedObjects;
};

/// A new object made by `init`, or null when its initialiser failed.
template <std::derived_from<NSObject> T>
[[nodiscard]] std::shared_ptr<T> create() {
    auto object = std::make_shared<T>();
    return object->init() ? object : nullptr;
}

/// A new object made by another initialiser: `create<LSSManager>(&LSSManager::initWithQueue,
/// queue)`. Null when the initialiser failed.
template <std::derived_from<NSObject> T, class Declarer, class... Parameters, class... Arguments>
[[nodiscard]] std::shared_ptr<T> create(bool (Declarer::*initializer)(Parameters...),
                                        Arguments&&... arguments) {
    auto object = std::make_shared<T>();
    return (object.get()->*initializer)(std::forward<Arguments>(arguments)...) ? object : nullptr;
}

/// An owning reference to an object from within it, under the type of the caller's `this`.
template <std::derived_from<NSObject> T>
[[nodiscard]] std::shared_ptr<T> strong(T* object) {
    return std::static_pointer_cast<T>(object->shared_from_this());
}

/// The same without owning: for the captures of delayed work.
template <std::derived_from<NSObject> T>
[[nodiscard]] std::weak_ptr<T> weak(T* object) {
    return strong(object);
}

/// The object that is attached to `object` under `key`, or null.
[[nodiscard]] std::shared_ptr<NSObject> objc_getAssociatedObject(const NSObject& object,
                                                                 const void* key);

/// Attaches `value` to `object` under `key`, in place of what was there; null detaches. `object`
/// owns `value` and lets go of it in its own destruction.
void objc_setAssociatedObject(NSObject& object, const void* key, std::shared_ptr<NSObject> value,
                              NSAssociationPolicy policy);
