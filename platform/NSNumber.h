#pragma once

#include <cstdint>
#include <variant>

#include "platform/NSInteger.h"
#include "platform/NSObject.h"

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

    /// `object` as a number; null where it is null or something else.
    [[nodiscard]] static const NSNumber* of(const NSObject* object);

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
