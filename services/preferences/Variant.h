#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <type_traits>

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

/// Of UTF-8 without NUL only; see `isStorable`.
template <>
struct Stored<std::string> {
    static constexpr const char* type = "s";

    static VariantPointer wrap(const std::string& value) {
        return VariantPointer(g_variant_ref_sink(g_variant_new_string(value.c_str())));
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

/// Whether the store can hold the value.
template <class T>
[[nodiscard]] bool isStorable(const T& value) {
    if constexpr (std::is_same_v<T, std::string>) {
        return g_utf8_validate_len(value.data(), value.size(), nullptr) != FALSE;
    } else {
        return true;
    }
}

} // namespace quorl::preferences
