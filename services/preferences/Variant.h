#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "services/preferences/Pointers.h"

namespace quorl::preferences {

/// How a value of type T looks in the store: `type` is the GVariant type, `wrap` and `unwrap` go
/// there and back. `unwrap` wants a value of that very type.
template <class T>
struct Stored;

template <>
struct Stored<bool> {
    static constexpr const char* type = "b";

    static VariantPointer wrap(bool value) {
        return VariantPointer(g_variant_ref_sink(g_variant_new_boolean(value ? TRUE : FALSE)));
    }

    static bool unwrap(GVariant& variant) { return g_variant_get_boolean(&variant) != FALSE; }
};

template <>
struct Stored<std::uint64_t> {
    static constexpr const char* type = "t";

    static VariantPointer wrap(std::uint64_t value) {
        return VariantPointer(g_variant_ref_sink(g_variant_new_uint64(value)));
    }

    static std::uint64_t unwrap(GVariant& variant) { return g_variant_get_uint64(&variant); }
};

/// What is not UTF-8 cannot be stored; it becomes the empty text.
template <>
struct Stored<std::string> {
    static constexpr const char* type = "s";

    static VariantPointer wrap(const std::string& value) {
        const bool isText = g_utf8_validate_len(value.data(), value.size(), nullptr) != FALSE;
        return VariantPointer(
            g_variant_ref_sink(g_variant_new_string(isText ? value.c_str() : "")));
    }

    static std::string unwrap(GVariant& variant) { return g_variant_get_string(&variant, nullptr); }
};

template <>
struct Stored<std::optional<std::uint64_t>> {
    static constexpr const char* type = "mt";

    static VariantPointer wrap(std::optional<std::uint64_t> value) {
        GVariant* const child = value ? g_variant_new_uint64(*value) : nullptr;
        return VariantPointer(
            g_variant_ref_sink(g_variant_new_maybe(G_VARIANT_TYPE_UINT64, child)));
    }

    static std::optional<std::uint64_t> unwrap(GVariant& variant) {
        const VariantPointer child(g_variant_get_maybe(&variant));
        return child ? std::optional(g_variant_get_uint64(child.get())) : std::nullopt;
    }
};

} // namespace quorl::preferences
