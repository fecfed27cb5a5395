#pragma once

#include <cstdint>
#include <memory>
#include <span>
#include <stdexcept>
#include <string>
#include <string_view>
#include <type_traits>
#include <vector>

#include <gio/gio.h>

#include "services/media/playlists/TextList.h"

/// A table as GVariant: a tuple of arrays of numbers, of which each is one piece of memory.
namespace quorl::media {

/// Frees what GLib gave away.
struct VariantFreed {
    void operator()(GVariant* variant) const { g_variant_unref(variant); }
};

using VariantPointer = std::unique_ptr<GVariant, VariantFreed>;

/// The type of an element, as GVariant spells it.
template <class Number>
inline constexpr const char* typeOfColumn = nullptr;

template <>
inline constexpr const char* typeOfColumn<char> = "y";
template <>
inline constexpr const char* typeOfColumn<std::uint8_t> = "y";
template <>
inline constexpr const char* typeOfColumn<std::uint32_t> = "u";
template <>
inline constexpr const char* typeOfColumn<std::uint64_t> = "t";
template <>
inline constexpr const char* typeOfColumn<std::int64_t> = "x";

/// Takes columns, one after the other.
class ColumnWriter {
  public:
    template <class Number>
    void add(const std::vector<Number>& column) {
        add(std::span<const Number>(column));
    }

    template <class Number>
    void add(std::span<const Number> column) {
        columns_.emplace_back(g_variant_ref_sink(g_variant_new_fixed_array(
            G_VARIANT_TYPE(typeOfColumn<Number>), column.data(), column.size(), sizeof(Number))));
    }

    void add(std::string_view text) { add(std::span<const char>(text)); }

    /// Two columns.
    void add(const TextList& texts) {
        add(texts.text());
        add(texts.ends());
    }

    /// All columns, of a type that says how many there are, and of which numbers.
    [[nodiscard]] std::string bytes() const;

  private:
    std::vector<VariantPointer> columns_;
};

/// The bytes are not what a writer made.
struct WrongColumns : std::runtime_error {
    WrongColumns() : std::runtime_error("the columns are not as they were written") {}
};

/// Gives columns back in the order in which they were added. Of bytes that no writer made, some
/// numbers, each of them in memory that is there. Throws `WrongColumns`.
class ColumnReader {
  public:
    /// @param type of the tuple. @param bytes outlive the reader.
    ColumnReader(const char* type, std::string_view bytes);

    /// The next column, which lives as long as the reader.
    template <class Number>
    [[nodiscard]] std::span<const Number> next() {
        gsize size = 0;
        const auto* const numbers = static_cast<const Number*>(
            g_variant_get_fixed_array(nextColumn(typeOfColumn<Number>), &size, sizeof(Number)));
        return {numbers, size};
    }

    [[nodiscard]] std::string_view nextText() {
        const auto text = next<char>();
        return {text.data(), text.size()};
    }

    [[nodiscard]] TextList nextTexts();

  private:
    [[nodiscard]] GVariant* nextColumn(const char* type);

    VariantPointer tuple_;
    std::vector<VariantPointer> columns_;
};

} // namespace quorl::media
