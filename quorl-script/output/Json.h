#pragma once

#include <concepts>
#include <cstddef>
#include <string>
#include <string_view>

namespace quorl {

/// What is written, as its text: made once, and put into other values as it is.
class Json {
  public:
    // Values are written where a value of JSON is wanted.
    template <class Value>
    Json(const Value& value) { // NOLINT(google-explicit-constructor)
        append(text_, value);
    }

    [[nodiscard]] const std::string& text() const { return text_; }

  protected:
    struct Written {
        std::string_view text;
    };

    explicit Json(Written what) : text_(what.text) {}

    /// Appends a value to a text of JSON. Null stands for what is not there and for what is no
    /// number.
    template <class Value>
    static void append(std::string& text, const Value& value) {
        if constexpr (std::derived_from<Value, Json>) {
            text += value.text();
        } else if constexpr (std::same_as<Value, std::nullptr_t>) {
            text += "null";
        } else if constexpr (std::same_as<Value, bool>) {
            text += value ? "true" : "false";
        } else if constexpr (std::integral<Value>) {
            text += std::to_string(value);
        } else if constexpr (std::floating_point<Value>) {
            appendNumber(text, static_cast<double>(value));
        } else if constexpr (std::convertible_to<const Value&, std::string_view>) {
            appendText(text, value);
        } else {
            value ? append(text, *value) : append(text, nullptr);
        }
    }

    /// Appends before the bracket that ends this list or object.
    template <class Append>
    void insert(Append append) {
        const char end = text_.back();
        text_.pop_back();
        if (text_.size() > 1) {
            text_ += ',';
        }
        append(text_);
        text_ += end;
    }

  private:
    static void appendNumber(std::string& text, double value);

    /// What is no UTF-8 is replaced.
    static void appendText(std::string& text, std::string_view value);

    std::string text_;
};

/// A list that grows; empty at first.
class JsonList : public Json {
  public:
    JsonList() : Json(Written{"[]"}) {}

    /// Adds a value at the end.
    template <class Value>
    JsonList& add(const Value& value) {
        insert([&value](std::string& text) { append(text, value); });
        return *this;
    }
};

/// An object that grows; without members at first. They keep their order.
class JsonObject : public Json {
  public:
    JsonObject() : Json(Written{"{}"}) {}

    /// Adds a member; there is none of this name yet, and it needs no escapes.
    template <class Value>
    JsonObject& set(std::string_view name, const Value& value) {
        insert([&](std::string& text) {
            text += '"';
            text += name;
            text += "\":";
            append(text, value);
        });
        return *this;
    }

    /// Adds the members of another object.
    JsonObject& setAll(const JsonObject& other);
};

} // namespace quorl
