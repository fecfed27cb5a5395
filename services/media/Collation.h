#pragma once

#include <memory>
#include <string_view>

#include <unicode/coll.h>

namespace quorl::media {

/// The order of names for the user: that of the locale in the environment (`LC_ALL`, `LC_COLLATE`,
/// `LANG`, the first that is set), whatever locale the program itself runs in; the order common to
/// most languages where that is "C", "POSIX", unset or unknown.
class Collation {
  public:
    Collation();

    /// Below 0: `left` is before `right`; 0: they sort alike. Both in UTF-8.
    [[nodiscard]] int compare(std::string_view left, std::string_view right) const;

  private:
    std::unique_ptr<icu::Collator> collator_;
};

} // namespace quorl::media
