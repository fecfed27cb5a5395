#pragma once

#include <charconv>
#include <cstdint>
#include <optional>
#include <stdexcept>
#include <string>

/// How the peer and the tests write a value in a line of text.

inline std::string textOf(bool value) { return value ? "true" : "false"; }

inline std::string textOf(std::uint64_t value) { return std::to_string(value); }

inline std::string textOf(std::optional<std::uint64_t> value) {
    return value ? std::to_string(*value) : "nothing";
}

inline std::string textOf(const std::string& value) { return value; }

inline std::uint64_t numberIn(const std::string& text) {
    std::uint64_t number = 0;
    const auto [end, failure] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (failure != std::errc{} || end != text.data() + text.size()) {
        throw std::invalid_argument("not a number: " + text);
    }
    return number;
}

inline void readText(const std::string& text, bool& value) { value = text == "true"; }

inline void readText(const std::string& text, std::uint64_t& value) { value = numberIn(text); }

inline void readText(const std::string& text, std::optional<std::uint64_t>& value) {
    value = text == "nothing" ? std::nullopt : std::optional(numberIn(text));
}

inline void readText(const std::string& text, std::string& value) { value = text; }
