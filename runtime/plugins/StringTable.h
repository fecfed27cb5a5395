#pragma once

#include <map>
#include <optional>
#include <string>
#include <vector>

#include "runtime/plugins/BundleFiles.h"
#include "runtime/plugins/Catalogue.h"

namespace quorl {

/// A bundle's texts: one gettext catalogue for each language,
/// `locale/<language>/LC_MESSAGES/<domain>.mo`, with keys as message ids. A damaged one counts as
/// none, for whoever asks for a text has a default for it; that is told on the standard error
/// stream once. No locale needs to be installed for a language. Main thread.
class StringTable {
  public:
    /// The domain of a bundle's default table.
    static constexpr const char* defaultDomain = "default";

    /// `files` outlive the table.
    explicit StringTable(const BundleFiles& files) : files_(files) {}

    /// The text for `key` in the first of `languages` that has a catalogue; "de_AT" is served by
    /// "de" too, and "en" ends the search. Null where that catalogue lacks the key.
    [[nodiscard]] std::optional<std::string> text(const std::vector<std::string>& languages,
                                                  const std::string& domain,
                                                  const std::string& key) const;

  private:
    /// What a list of languages led to; null for no catalogue.
    struct Found {
        std::vector<std::string> languages;
        const Texts* texts = nullptr;
    };

    [[nodiscard]] const Texts* firstCatalogue(const std::vector<std::string>& languages,
                                              const std::string& domain) const;
    [[nodiscard]] const Texts* catalogue(const std::string& language,
                                         const std::string& domain) const;

    const BundleFiles& files_;
    mutable std::map<std::pair<std::string, std::string>, std::optional<Texts>> catalogues_;
    mutable std::map<std::string, Found> lastFound_; ///< of each domain
};

/// The user's languages as the environment names them: `LANGUAGE`, else `LC_ALL`, `LC_MESSAGES` or
/// `LANG`, without encodings; "en" where it names none.
[[nodiscard]] std::vector<std::string> environmentLanguages();

} // namespace quorl
