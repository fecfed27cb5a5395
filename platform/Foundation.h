#pragma once

#include <concepts>
#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <type_traits>
#include <typeinfo>
#include <utility>
#include <variant>
#include <vector>

/// Foundation services. Unless said otherwise everything here is for the main thread, texts are
/// UTF-8, a text that may be missing is a `std::optional<std::string>`, a `std::shared_ptr` owns
/// what it points to and may be null only where said, and a raw pointer or reference never owns.

/// An unsigned and a signed machine word.
using NSUInteger = std::uintptr_t;
using NSInteger = std::intptr_t;

/// `value` truncated toward zero, held within what `Unsigned` can hold. Negative values and NaN
/// give 0. For `std::uint32_t` and `std::uint64_t`, so for `NSUInteger` on every target.
template <class Unsigned>
Unsigned NSSaturatingTruncate(double value);

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
                                         std::uintptr_t);

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

/// A message: the name of a method of an object that is known only when the message is sent. The
/// method may take fewer arguments than are sent; the rest is dropped.
template <class Signature>
class Selector;

template <class Result, class... Arguments>
class Selector<Result(Arguments...)> {
  public:
    /// The selector of `Method`, a member function of a class derived from `NSObject`. `name` is
    /// its name with a colon after each argument, and outlives the selector.
    template <auto Method>
    [[nodiscard]] static Selector of(std::string_view name) {
        return {name, [](NSObject& receiver, Arguments... arguments) -> Result {
                    return send(receiver, Method, std::forward<Arguments>(arguments)...);
                }};
    }

    [[nodiscard]] std::string_view name() const { return _name; }

    /// Sends the message. `receiver` is of the class that the selector was made for.
    Result operator()(NSObject& receiver, Arguments... arguments) const {
        return _invoke(receiver, std::forward<Arguments>(arguments)...);
    }

  private:
    using Invoke = Result (*)(NSObject&, Arguments...);

    Selector(std::string_view name, Invoke invoke) : _name(name), _invoke(invoke) {}

    template <class T>
    static Result send(NSObject& receiver, Result (T::*method)(Arguments...),
                       Arguments... arguments) {
        return (static_cast<T&>(receiver).*method)(std::forward<Arguments>(arguments)...);
    }

    template <class T>

    requires(sizeof...(Arguments) > 0) static Result
        send(NSObject& receiver, Result (T::*method)(), Arguments...) {
        return (static_cast<T&>(receiver).*method)();
    }

    std::string_view _name;
    Invoke _invoke;
};

/// An immutable ordered list, shared by whoever holds it. Null counts as empty.
template <class T>
using NSArray = std::shared_ptr<const std::vector<std::shared_ptr<T>>>;

/// The elements of a list; none for a null list. Valid while the caller holds the list.
template <class T>
[[nodiscard]] std::span<const std::shared_ptr<T>>
elements(const std::shared_ptr<const std::vector<std::shared_ptr<T>>>& list) {
    return list ? std::span<const std::shared_ptr<T>>(*list)
                : std::span<const std::shared_ptr<T>>();
}

/// An immutable table from text to object.
template <class T>
using NSDictionary = std::shared_ptr<const std::map<std::string, std::shared_ptr<T>, std::less<>>>;

/// A number or truth value. Immutable; any thread.
class NSNumber final : public NSObject {
  public:
    using Value = std::variant<std::uint64_t, std::int64_t, double>;

    explicit NSNumber(Value value) : _value(value) {}

    [[nodiscard]] static std::shared_ptr<NSNumber> numberWithBool(bool value);
    [[nodiscard]] static std::shared_ptr<NSNumber> numberWithUnsignedInteger(NSUInteger value);
    [[nodiscard]] static std::shared_ptr<NSNumber> numberWithUnsignedLongLong(std::uint64_t value);
    [[nodiscard]] static std::shared_ptr<NSNumber> numberWithLongLong(std::int64_t value);
    [[nodiscard]] static std::shared_ptr<NSNumber> numberWithDouble(double value);

    /// The value under another type. An integer keeps its low bits; a double is truncated as by
    /// `NSSaturatingTruncate`.
    [[nodiscard]] bool boolValue() const;
    [[nodiscard]] NSUInteger unsignedIntegerValue() const;
    [[nodiscard]] std::uint64_t unsignedLongLongValue() const;
    [[nodiscard]] double doubleValue() const;

    /// Whether `other` is a number of the same mathematical value, whatever types both were made
    /// of.
    [[nodiscard]] bool isEqual(const NSObject* other) const override;

    [[nodiscard]] const Value& value() const { return _value; }

  private:
    Value _value;
};

/// An error that a service reports.
class NSError final : public NSObject {
  public:
    explicit NSError(std::string localizedDescription)
        : _localizedDescription(std::move(localizedDescription)) {}

    /// One sentence for a person, with what to do about it.
    [[nodiscard]] const std::string& localizedDescription() const { return _localizedDescription; }

  private:
    std::string _localizedDescription;
};

/// A moment of the wall clock. Immutable.
class NSDate final : public NSObject {
  public:
    /// `seconds` since the start of 1970, UTC.
    explicit NSDate(double seconds) : _seconds(seconds) {}

    /// Now.
    [[nodiscard]] static std::shared_ptr<NSDate> date();

    /// Seconds from `earlier` to this; negative when `earlier` is the later one.
    [[nodiscard]] double timeIntervalSinceDate(const NSDate& earlier) const;

  private:
    double _seconds;
};

/// The place of a row in a table.
struct NSIndexPath {
    NSInteger section = 0;
    NSInteger row = 0;

    [[nodiscard]] static constexpr NSIndexPath indexPathForRow_inSection(NSInteger row,
                                                                         NSInteger section) {
        return {section, row};
    }

    [[nodiscard]] auto operator<=>(const NSIndexPath&) const = default;
};

/// The name of a notification. Names are constants that live as long as the process.
using NSNotificationName = std::string_view;

/// A notification on its way. `object`, the sender, may be null and lives until the post returns.
struct NSNotification {
    NSNotificationName name;
    NSObject* object;
};

/// What a notification is answered with: a method with one `const NSNotification&`, or with none.
using NSNotificationSelector = Selector<void(const NSNotification&)>;

/// Hands notifications to those who registered for them. Any thread: observers are called on the
/// thread that posts, before the post returns, the newest registration first. Observers may come
/// and go during a post: one that has gone is not called any more, one that has come is called by
/// the next post.
class NSNotificationCenter : public NSObject {
  public:
    /// The one centre of the process.
    [[nodiscard]] static NSNotificationCenter& defaultCenter();

    /// Registers `observer`, which is not owned, for `name`, from `object` only, or from any sender
    /// where `object` is null. Each registration counts: one made twice is called twice.
    virtual void addObserver_selector_name_object(NSObject* observer,
                                                  NSNotificationSelector selector,
                                                  NSNotificationName name,
                                                  const NSObject* object) = 0;

    /// Takes back every registration of `observer`; none is no error. To be called in the
    /// observer's destructor at the latest.
    virtual void removeObserver(const NSObject* observer) = 0;

    /// Calls who registered for `name` and `object`. `object` may be null.
    virtual void postNotificationName_object(NSNotificationName name, NSObject* object) = 0;
};

/// A directory of code with its resources: a plug-in, or the program itself.
class NSBundle : public NSObject {
  public:
    /// The bundle that holds the code of `cls`, never null; the program's own for a class of the
    /// program or of the platform.
    [[nodiscard]] static std::shared_ptr<NSBundle> bundleForClass(const Class& cls);

    /// The identifier of the bundle's registration, or null where it has none.
    [[nodiscard]] virtual std::optional<std::string> bundleIdentifier() const = 0;

    /// The text for `key` in the user's language, looked up anew at each call in `table`, or in the
    /// default table where that is null. Without a text for the key: `value`, or `key` itself where
    /// `value` is null or empty.
    [[nodiscard]] virtual std::string
    localizedStringForKey_value_table(const std::string& key,
                                      const std::optional<std::string>& value,
                                      const std::optional<std::string>& table) const = 0;
};

/// What a placeholder of a format can be filled with.
using NSFormatArgument = std::variant<NSUInteger, std::string>;

struct NSString {
    /// `format` with its placeholders filled: `%tu` with a count in the user's digits and grouping,
    /// `%@` with a text, `%%` with a percent sign, `%2$@` and `%2$tu` with the argument of that
    /// number. A placeholder that is unknown or has no argument stays as it is written, an argument
    /// that no placeholder asks for is dropped, and an argument of the other type is shown as what
    /// it is; so no format can read beyond its arguments.
    [[nodiscard]] static std::string
    localizedStringWithFormat(std::string_view format,
                              const std::vector<NSFormatArgument>& arguments);
};

/// The ownership policy of an associated object: owned, not atomic.
inline constexpr std::uintptr_t OBJC_ASSOCIATION_RETAIN_NONATOMIC = 1;

/// The object that is attached to `object` under `key`, or null.
[[nodiscard]] std::shared_ptr<NSObject> objc_getAssociatedObject(const NSObject& object,
                                                                 const void* key);

/// Attaches `value` to `object` under `key`, in place of what was there; null detaches. `object`
/// owns `value` and lets go of it in its own destruction. `policy` is
/// `OBJC_ASSOCIATION_RETAIN_NONATOMIC`.
void objc_setAssociatedObject(NSObject& object, const void* key, std::shared_ptr<NSObject> value,
                              std::uintptr_t policy);
