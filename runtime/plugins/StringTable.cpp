#include "runtime/plugins/StringTable.h"

#include <algorithm>
#include <cstdlib>
#include <iostream>

#include "runtime/plugins/BundleError.h"

namespace quorl {

namespace {

/// "de_AT@euro" is served by itself, "de_AT" and "de".
std::vector<std::string> namesFor(const std::string& language) {
    std::vector<std::string> names{language};
    for (const char separator : {'@', '_'}) {
        if (const auto at = names.back().rfind(separator); at != std::string::npos) {
            names.push_back(names.back().substr(0, at));
        }
    }
    return names;
}

/// A tag of either spelling ("de-AT", "de_AT.UTF-8") as the directories of catalogues are named;
/// empty for the locales that stand for no language, and for what is no name at all.
std::string languageName(std::string_view tag) {
    const auto encoding = tag.find('.');
    const auto modifier = tag.find('@');
    std::string name(tag.substr(0, std::min(encoding, modifier)));
    if (modifier != std::string_view::npos) {
        name += tag.substr(modifier);
    }
    std::replace(name.begin(), name.end(), '-', '_');
    const bool isPath = name.find('/') != std::string::npos;
    return isPath || name == "C" || name == "POSIX" ? std::string() : name;
}

const char* environmentValue(std::initializer_list<const char*> names) {
    for (const char* name : names) {
        if (const char* value = std::getenv(name); value && *value) {
            return value;
        }
    }
    return "";
}

} // namespace

std::vector<std::string> environmentLanguages() {
    std::string_view list = environmentValue({"LANGUAGE", "LC_ALL", "LC_MESSAGES", "LANG"});
    std::vector<std::string> languages;
    while (!list.empty()) {
        const auto length = std::min(list.find(':'), list.size());
        if (auto name = languageName(list.substr(0, length)); !name.empty()) {
            languages.push_back(std::move(name));
        }
        list.remove_prefix(std::min(length + 1, list.size()));
    }
    if (languages.empty()) {
        languages.emplace_back("en");
    }
    return languages;
}

const Texts* StringTable::catalogue(const std::string& language, const std::string& domain) const {
    auto [entry, isNew] = catalogues_.try_emplace({language, domain});
    const auto file = "locale/" + language + "/LC_MESSAGES/" + domain + ".mo";
    if (isNew && files_.has(file)) {
        try {
            entry->second = readCatalogue(files_.read(file), files_.path(file));
        } catch (const BundleError& error) {
            std::clog << error.what() << std::endl;
        }
    }
    return entry->second ? &*entry->second : nullptr;
}

std::optional<std::string> StringTable::text(const std::vector<std::string>& languages,
                                             const std::string& domain,
                                             const std::string& key) const {
    if (key.empty()) {
        return std::nullopt; // a catalogue keeps its own description under the empty key
    }
    auto [last, isNew] = lastFound_.try_emplace(domain);
    auto& [ofLanguages, texts] = last->second;
    if (isNew || ofLanguages != languages) {
        ofLanguages = languages;
        texts = firstCatalogue(languages, domain);
    }
    if (!texts) {
        return std::nullopt;
    }
    const auto text = texts->find(key);
    return text == texts->end() ? std::nullopt : std::optional(text->second);
}

const Texts* StringTable::firstCatalogue(const std::vector<std::string>& languages,
                                         const std::string& domain) const {
    for (const std::string& language : languages) {
        for (const std::string& name : namesFor(languageName(language))) {
            if (const Texts* texts = catalogue(name, domain)) {
                return texts;
            }
            if (name == "en") {
                return nullptr; // the default texts are English
            }
        }
    }
    return nullptr;
}

} // namespace quorl
