#include "quorl-script/input/Field.h"

#include <charconv>
#include <cmath>
#include <limits>

namespace quorl {

namespace {

constexpr double largestExact = 9007199254740992.0; // 2^53: above it doubles skip integers

/// A text of nothing but decimal digits as a number that 64 bits hold.
std::optional<std::uint64_t> digits(const std::string& text) {
    std::uint64_t value = 0;
    const char* end = text.data() + text.size();
    const auto parsed = std::from_chars(text.data(), end, value);
    return parsed.ec == std::errc() && parsed.ptr == end ? std::optional(value) : std::nullopt;
}

bool isWhole(double value) { return std::trunc(value) == value && std::abs(value) <= largestExact; }

std::string rangeText(std::uint64_t largest) {
    return "a whole number from 0 to " + std::to_string(largest);
}

} // namespace

Field Field::operator[](const std::string& name) const {
    if (!isGiven() || !value_->is_object()) {
        refuse("an object");
    }
    const auto found = value_->find(name);
    return {found == value_->end() ? nullptr : &*found, name_.empty() ? name : name_ + "." + name};
}

std::vector<Field> Field::members() const {
    if (!isGiven() || !value_->is_object()) {
        refuse("an object");
    }
    std::vector<Field> fields;
    for (const auto& [name, value] : value_->items()) {
        fields.emplace_back(&value, name_.empty() ? name : name_ + "." + name);
    }
    return fields;
}

std::vector<Field> Field::elements() const {
    if (!isGiven() || !value_->is_array()) {
        refuse("a list");
    }
    std::vector<Field> fields;
    fields.reserve(value_->size());
    for (const auto& value : *value_) {
        fields.emplace_back(&value, name_ + "[" + std::to_string(fields.size()) + "]");
    }
    return fields;
}

bool Field::boolean() const {
    if (!isGiven() || !value_->is_boolean()) {
        refuse("true or false");
    }
    return value_->get<bool>();
}

const std::string& Field::text() const {
    if (!isGiven() || !value_->is_string()) {
        refuse("a text");
    }
    return value_->get_ref<const std::string&>();
}

std::uint64_t Field::count(std::uint64_t largest) const {
    std::optional<std::uint64_t> value;
    if (isGiven() && value_->is_number_unsigned()) {
        value = value_->get<std::uint64_t>();
    } else if (isGiven() && value_->is_number()) {
        const auto number = value_->get<double>();
        value = number >= 0 && isWhole(number) ? std::optional(static_cast<std::uint64_t>(number))
                                               : std::nullopt;
    }
    if (!value || *value > largest) {
        refuse(rangeText(largest));
    }
    return *value;
}

std::int64_t Field::integer() const {
    constexpr auto largest = std::numeric_limits<std::int64_t>::max();
    if (isGiven() && value_->is_number_unsigned() &&
        value_->get<std::uint64_t>() <= std::uint64_t{largest}) {
        return value_->get<std::int64_t>();
    }
    if (isGiven() && value_->is_number_integer() && !value_->is_number_unsigned()) {
        return value_->get<std::int64_t>();
    }
    if (isGiven() && value_->is_number_float() && isWhole(value_->get<double>())) {
        return static_cast<std::int64_t>(value_->get<double>());
    }
    refuse("a whole number");
}

double Field::number() const {
    if (!isGiven() || !value_->is_number()) {
        refuse("a number");
    }
    return value_->get<double>();
}

std::uint64_t Field::id() const {
    const auto value = isGiven() && value_->is_string()
                           ? digits(value_->get_ref<const std::string&>())
                           : std::nullopt;
    if (!value) {
        refuse("a 64-bit id: a text of decimal digits up to \"18446744073709551615\"");
    }
    return *value;
}

std::uint64_t Field::figure() const { return isGiven() && value_->is_string() ? id() : count(); }

std::int64_t Field::seconds() const {
    constexpr double nanoseconds = 1e9;
    constexpr double largest = 9.2e9;
    const double value = number();
    if (std::abs(value) > largest) {
        refuse("a number of seconds between -9200000000 and 9200000000");
    }
    return std::llround(value * nanoseconds);
}

bool Field::booleanOr(bool otherwise) const { return isGiven() ? boolean() : otherwise; }

std::optional<std::string> Field::textOrNull() const {
    return isGiven() ? std::optional(text()) : std::nullopt;
}

std::uint64_t Field::countOr(std::uint64_t otherwise, std::uint64_t largest) const {
    return isGiven() ? count(largest) : otherwise;
}

double Field::numberOr(double otherwise) const { return isGiven() ? number() : otherwise; }

void Field::refuse(const std::string& what) const {
    const std::string subject = name_.empty() ? "the command" : "\"" + name_ + "\"";
    throw CommandError(isGiven() ? subject + " takes " + what
                                 : subject + " is missing; it takes " + what);
}

} // namespace quorl
