#pragma once

#include <memory>
#include <string>
#include <string_view>

#include <unicode/coll.h>

namespace quorl::media {

/// The order of names for the user: that of the locale in the environment (`LC_ALL`, `LC_COLLATE`,
/// `LANG`, the first that is set), whatever locale the program itself runs in; the order common to
/// most languages where that is "C", "POSIX", unset or unknown.
class Collation {
  public:
    Collation();

    /// Bytes that sort as `text`, which is in UTF-8, does for the user.
    [[nodiscard]] std::string key(std::string_view text) const;

  private:
    std::unique_ptr<icu::Collator> collator_;
};

} // namespace quorl::media
