#include "platform/NSNumber.h"

#include <cmath>
#include <typeinfo>

namespace {

/// Whether a double and an integer stand for the same mathematical value. Comparing as doubles
/// alone would take neighbours beyond 2^53 for equal.
template <class Integer>
bool isSameValue(double real, Integer integer) {
    constexpr double beyond = 18446744073709551616.0; // 2^64
    if (!(real > -beyond && real < beyond) || std::trunc(real) != real) {
        return false;
    }
    const auto magnitude = static_cast<std::uint64_t>(std::abs(real));
    if (std::cmp_less(integer, 0)) {
        return real < 0 && magnitude == 0 - static_cast<std::uint64_t>(integer);
    }
    return (real >= 0) && magnitude == static_cast<std::uint64_t>(integer);
}

struct SameValue {
    bool operator()(double left, double right) const { return left == right; }

    template <std::integral Integer>
    bool operator()(double left, Integer right) const {
        return isSameValue(left, right);
    }

    template <std::integral Integer>
    bool operator()(Integer left, double right) const {
        return isSameValue(right, left);
    }

    template <std::integral Left, std::integral Right>
    bool operator()(Left left, Right right) const {
        return std::cmp_equal(left, right);
    }
};

} // namespace

std::shared_ptr<NSNumber> NSNumber::numberWithBool(bool value) {
    static const auto no = std::make_shared<NSNumber>(Value(std::uint64_t{0}));
    static const auto yes = std::make_shared<NSNumber>(Value(std::uint64_t{1}));
    return value ? yes : no;
}

std::shared_ptr<NSNumber> NSNumber::numberWithUnsignedInteger(NSUInteger value) {
    return numberWithUnsignedLongLong(value);
}

std::shared_ptr<NSNumber> NSNumber::numberWithUnsignedLongLong(std::uint64_t value) {
    return std::make_shared<NSNumber>(Value(value));
}

std::shared_ptr<NSNumber> NSNumber::numberWithLongLong(std::int64_t value) {
    return std::make_shared<NSNumber>(Value(value));
}

std::shared_ptr<NSNumber> NSNumber::numberWithDouble(double value) {
    return std::make_shared<NSNumber>(Value(value));
}

const NSNumber* NSNumber::of(const NSObject* object) {
    // No class is derived from this one, so that it need not be looked for among base classes.
    return object != nullptr && typeid(*object) == typeid(NSNumber)
               ? static_cast<const NSNumber*>(object)
               : nullptr;
}

bool NSNumber::boolValue() const {
    return std::visit([](auto value) { return value != 0; }, _value);
}

NSUInteger NSNumber::unsignedIntegerValue() const {
    if (const auto* real = std::get_if<double>(&_value)) {
        return NSSaturatingTruncate<NSUInteger>(*real);
    }
    return static_cast<NSUInteger>(unsignedLongLongValue());
}

std::uint64_t NSNumber::unsignedLongLongValue() const {
    if (const auto* real = std::get_if<double>(&_value)) {
        return NSSaturatingTruncate<std::uint64_t>(*real);
    }
    return std::visit([](auto value) { return static_cast<std::uint64_t>(value); }, _value);
}

double NSNumber::doubleValue() const {
    return std::visit([](auto value) { return static_cast<double>(value); }, _value);
}

bool NSNumber::isEqual(const NSObject* other) const {
    const auto* number = of(other);
    return number != nullptr && std::visit(SameValue{}, _value, number->_value);
}
