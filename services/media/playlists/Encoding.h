#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace quorl::media {

/// What a text file is written in.
struct Encoding {
    /// As `converted` takes it. Bytes that are no valid UTF-8 may be called that nevertheless.
    std::string name;
    /// The bytes of the byte-order mark, which are no part of the text.
    std::size_t markSize = 0;
};

/// The encoding that a byte-order mark names. Where there is none: UTF-16 if the text plainly
/// begins with an ASCII character of it, else UTF-8.
[[nodiscard]] Encoding encodingOfText(std::string_view bytes);

/// The encoding that an XML declaration in ASCII names; empty where there is no such declaration.
[[nodiscard]] std::string_view declaredEncoding(std::string_view xml);

/// `bytes`, which are in `encoding`, as UTF-8. Null: there is no such encoding, or the bytes are
/// not valid in it.
[[nodiscard]] std::optional<std::string> converted(std::string_view bytes,
                                                   const std::string& encoding);

} // namespace quorl::media
