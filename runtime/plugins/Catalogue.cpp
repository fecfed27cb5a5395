#include "runtime/plugins/Catalogue.h"

#include <cstdint>

#include <unicode/ustring.h>

#include "runtime/plugins/BundleError.h"

namespace quorl {

namespace {

constexpr std::size_t numberSize = 4;
constexpr std::string_view littleEndianMark = "\xDE\x12\x04\x95";
constexpr std::string_view bigEndianMark = "\x95\x04\x12\xDE";

// Where the numbers of a catalogue's head are.
constexpr std::uint64_t countPlace = 8;
constexpr std::uint64_t keysPlace = 12;
constexpr std::uint64_t textsPlace = 16;

bool isUtf8(std::string_view text) {
    UErrorCode status = U_ZERO_ERROR;
    u_strFromUTF8(nullptr, 0, nullptr, text.data(), static_cast<std::int32_t>(text.size()),
                  &status);
    return status != U_INVALID_CHAR_FOUND;
}

/// Reads what the bytes of a catalogue hold, trusting none of them.
class Reader {
  public:
    Reader(std::string_view bytes, const std::filesystem::path& file)
        : bytes_(bytes), file_(file), isBigEndian_(bytes.starts_with(bigEndianMark)) {
        require(isBigEndian_ || bytes.starts_with(littleEndianMark));
    }

    void require(bool condition) const {
        if (!condition) {
            throw BundleError(file_, "this file is damaged: it is not a catalogue of texts in "
                                     "UTF-8; install the plug-in again");
        }
    }

    [[nodiscard]] std::uint32_t number(std::uint64_t place) const {
        require(place + numberSize <= bytes_.size());
        const auto digits = bytes_.substr(static_cast<std::size_t>(place), numberSize);
        std::uint32_t value = 0;
        for (std::size_t index = 0; index < numberSize; ++index) {
            const auto next = isBigEndian_ ? index : numberSize - 1 - index;
            const auto byte = static_cast<unsigned char>(digits[next]);
            value = value << 8U | byte;
        }
        return value;
    }

    /// The string whose length and place are at this place of a table. A NUL follows it.
    [[nodiscard]] std::string_view string(std::uint64_t table, std::uint64_t index) const {
        const std::uint64_t entry = table + index * 2 * numberSize;
        const std::uint32_t length = number(entry);
        const std::uint32_t place = number(entry + numberSize);
        const std::uint64_t end = std::uint64_t{place} + length;
        require(end < bytes_.size() && bytes_[std::size_t{place} + length] == '\0');
        return bytes_.substr(place, length);
    }

  private:
    std::string_view bytes_;
    const std::filesystem::path& file_;
    bool isBigEndian_;
};

} // namespace

Texts readCatalogue(std::string_view bytes, const std::filesystem::path& file) {
    const Reader reader(bytes, file);
    const auto count = reader.number(countPlace);
    const auto keys = reader.number(keysPlace);
    const auto texts = reader.number(textsPlace);
    Texts result;
    std::size_t size = 0;
    for (std::uint64_t index = 0; index < count; ++index) {
        const auto key = reader.string(keys, index);
        const auto text = reader.string(texts, index);
        size += key.size() + text.size();
        reader.require(size < bytes.size()); // or many keys share one long text
        reader.require(isUtf8(text));
        result.emplace(key.data(),
                       text.data()); // as far as the first NUL, where plural forms follow
    }
    return result;
}

} // namespace quorl
