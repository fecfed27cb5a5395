#include "services/language/Languages.h"

#include <algorithm>
#include <cstdlib>

#include <glib.h>
#include <libintl.h>

namespace quorl::language {

namespace {

constexpr auto english = "en";
constexpr auto domain = "quorl";

std::vector<std::string>& followed() {
    static std::vector<std::string> languages{english};
    return languages;
}

std::filesystem::path cataloguesOfThisProgram() {
    std::error_code failed;
    const auto program = std::filesystem::read_symlink("/proc/self/exe", failed);
    return program.parent_path().parent_path() / "share" / "locale";
}

/// "de" of "de_AT" and of "de@euro".
std::string plain(const std::string& language) {
    return language.substr(0, language.find_first_of("_@"));
}

bool isServed(const std::string& language, const std::filesystem::path& catalogues) {
    const auto has = [&catalogues](const std::string& name) {
        std::error_code failed;
        return exists(catalogues / name / "LC_MESSAGES" / (std::string(domain) + ".mo"), failed);
    };
    return plain(language) == english || has(language) || has(plain(language));
}

} // namespace

void followLanguages(const std::vector<std::string>& wished,
                     const std::filesystem::path& catalogues) {
    const auto directory = catalogues.empty() ? cataloguesOfThisProgram() : catalogues;
    const auto first = std::ranges::find_if(
        wished, [&directory](const auto& language) { return isServed(language, directory); });
    followed().assign(first, wished.end());
    if (followed().empty()) {
        followed().emplace_back(english);
    }
    setenv("LANGUAGE", followed().front().c_str(), 1);
    bindtextdomain(domain, directory.c_str());
    bind_textdomain_codeset(domain, "UTF-8");
    textdomain(domain); // without it, gettext would go on with what it has found before
}

/// GLib names each one with its encoding, too, and ends with what stands for none.
std::vector<std::string> usersLanguages() {
    std::vector<std::string> languages;
    for (const char* const* name = g_get_language_names(); *name != nullptr; ++name) {
        const std::string language = *name;
        if (language != "C" && language != "POSIX" && language.find('.') == std::string::npos) {
            languages.push_back(language);
        }
    }
    return languages;
}

const std::vector<std::string>& followedLanguages() { return followed(); }

} // namespace quorl::language
