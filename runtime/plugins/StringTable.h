#pragma once

#include <filesystem>
#include <locale>
#include <map>
#include <optional>
#include <string>
#include <vector>

namespace quorl {

/// A bundle's texts: one gettext catalogue for each language, `<language>/LC_MESSAGES/<domain>.mo`
/// in a directory, with keys as message ids. No locale needs to be installed for a language. Main
/// thread.
class StringTable {
  public:
    /// The domain of a bundle's default table.
    static constexpr const char* defaultDomain = "default";

    explicit StringTable(std::filesystem::path directory) : directory_(std::move(directory)) {}

    /// The text for `key` in the first of `languages` that has a catalogue; "de_AT" is served by
    /// "de" too, and "en" ends the search. Null where that catalogue lacks the key.
    [[nodiscard]] std::optional<std::string> text(const std::vector<std::string>& languages,
                                                  const std::string& domain,
                                                  const std::string& key) const;

  private:
    [[nodiscard]] const std::locale* catalogue(const std::string& language,
                                               const std::string& domain) const;

    std::filesystem::path directory_;
    mutable std::map<std::pair<std::string, std::string>, std::optional<std::locale>> catalogues_;
};

/// The user's languages as the environment names them: `LANGUAGE`, else `LC_ALL`, `LC_MESSAGES` or
/// `LANG`, without encodings; "en" where it names none.
[[nodiscard]] std::vector<std::string> environmentLanguages();

} // namespace quorl
