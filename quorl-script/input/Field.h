#pragma once

#include <cstdint>
#include <optional>
#include <stdexcept>
#include <string>
#include <vector>

#include <nlohmann/json.hpp>

namespace quorl {

/// Why a command was not carried out: a sentence for its author.
class CommandError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

/// A value of a command with the name that errors call it by ("playlists[0].id"). It belongs to the
/// parsed line and is not kept. Whatever is missing or of another type than asked for throws a
/// `CommandError` that names the field; null counts as missing.
class Field {
  public:
    /// `value` may be null.
    Field(const nlohmann::json* value, std::string name) : value_(value), name_(std::move(name)) {}

    /// Whether there is a value that is not null.
    [[nodiscard]] bool isGiven() const { return value_ != nullptr && !value_->is_null(); }

    [[nodiscard]] bool isText() const { return isGiven() && value_->is_string(); }

    /// Whether there is a value, be it null.
    [[nodiscard]] bool isPresent() const { return value_ != nullptr; }

    [[nodiscard]] const std::string& name() const { return name_; }

    /// A member of an object, there or not.
    [[nodiscard]] Field operator[](const std::string& name) const;

    /// All members of an object.
    [[nodiscard]] std::vector<Field> members() const;

    /// The elements of a list.
    [[nodiscard]] std::vector<Field> elements() const;

    [[nodiscard]] bool boolean() const;
    [[nodiscard]] const std::string& text() const;

    /// A whole number in a range. A number written with a fraction of zero is whole.
    [[nodiscard]] std::uint64_t count(std::uint64_t largest = UINT64_MAX) const;
    [[nodiscard]] std::int64_t integer() const;

    [[nodiscard]] double number() const;

    /// A 64-bit id: a text of decimal digits.
    [[nodiscard]] std::uint64_t id() const;

    /// A 64-bit figure that is no id: a whole number, or a text as an id is.
    [[nodiscard]] std::uint64_t figure() const;

    /// A number of seconds in nanoseconds, within what 64 bits can hold.
    [[nodiscard]] std::int64_t seconds() const;

    /// The same for what may be missing.
    [[nodiscard]] bool booleanOr(bool otherwise) const;
    [[nodiscard]] std::optional<std::string> textOrNull() const;
    [[nodiscard]] std::uint64_t countOr(std::uint64_t otherwise,
                                        std::uint64_t largest = UINT64_MAX) const;
    [[nodiscard]] double numberOr(double otherwise) const;

    /// Says that the field takes `what` and not what it has.
    [[noreturn]] void refuse(const std::string& what) const;

  private:
    const nlohmann::json* value_;
    std::string name_;
};

} // namespace quorl
