#pragma once

#include <filesystem>
#include <functional>
#include <map>
#include <string>
#include <string_view>

namespace quorl {

/// Texts by their keys.
using Texts = std::map<std::string, std::string, std::less<>>;

/// The texts in a compiled gettext catalogue of either byte order, whose `bytes` may be any. Of a
/// text with plural forms there is the first, for texts are asked for by their keys alone. The
/// catalogue's description of itself stands under the empty key.
///
/// Throws `BundleError` about `file`, where the bytes are from, unless they are a whole catalogue
/// with texts in UTF-8.
[[nodiscard]] Texts readCatalogue(std::string_view bytes, const std::filesystem::path& file);

} // namespace quorl
