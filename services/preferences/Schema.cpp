#include "services/preferences/Schema.h"

#include <filesystem>
#include <string_view>
#include <system_error>

#include "services/language/Translated.h"
#include "services/preferences/Preference.h"
#include "services/preferences/Variant.h"

namespace quorl::preferences {

using language::filled;
using language::translated;

namespace {

constexpr auto prefix = "org.quorl.Velora.";
constexpr auto trialPrefix = "org.quorl.Velora.Trial.";
constexpr auto schemaFolder = "glib-2.0/schemas";

std::filesystem::path directoryBesideProgram() {
    std::error_code failed;
    const auto program = std::filesystem::read_symlink("/proc/self/exe", failed);
    return (program.parent_path() / "../share" / schemaFolder).lexically_normal();
}

std::string searchedDirectories() {
    std::string text = directoryBesideProgram().string();
    const auto add = [&text](const std::filesystem::path& directory) {
        text += ", " + directory.string();
    };
    if (const char* extra = g_getenv("GSETTINGS_SCHEMA_DIR")) {
        add(extra);
    }
    add(std::filesystem::path(g_get_user_data_dir()) / schemaFolder);
    for (const char* const* data = g_get_system_data_dirs(); *data != nullptr; ++data) {
        add(std::filesystem::path(*data) / schemaFolder);
    }
    return text;
}

SchemaPointer lookUp(const char* id) {
    GSettingsSchemaSource* const usual = g_settings_schema_source_get_default();
    const SourcePointer besideProgram(g_settings_schema_source_new_from_directory(
        directoryBesideProgram().c_str(), usual, FALSE, nullptr));
    GSettingsSchemaSource* const source = besideProgram ? besideProgram.get() : usual;
    return SchemaPointer(source == nullptr ? nullptr
                                           : g_settings_schema_source_lookup(source, id, TRUE));
}

bool hasValue(GSettingsSchema& schema, const char* key, const char* type) {
    if (!g_settings_schema_has_key(&schema, key)) {
        return false;
    }
    const KeyPointer description(g_settings_schema_get_key(&schema, key));
    const char* const found =
        g_variant_type_peek_string(g_settings_schema_key_get_value_type(description.get()));
    return found == std::string(type);
}

/// The keys that the schema lacks, or has with another type, separated by commas.
/// @param name that the table has for it.
std::string misfits(GSettingsSchema& schema, std::string_view name) {
    std::string text;
    forEachPreference([&]<class T>(const Preference<T>& preference) {
        if (preference.schema == name && !hasValue(schema, preference.key, Stored<T>::type)) {
            text += (text.empty() ? "" : ", ") + std::string(preference.key);
        }
    });
    return text;
}

/// Empty where the schema can be used.
std::string problemOf(const SchemaPointer& schema, std::string_view name, const std::string& id) {
    if (!schema) {
        return filled(
            translated("The settings cannot be opened, because their schema {id} is in none of "
                       "these directories: {directories}. Install the program again; or run "
                       "glib-compile-schemas on the one that holds {id}.gschema.xml."),
            {{"id", id}, {"directories", searchedDirectories()}});
    }
    const auto wrong = misfits(*schema, name);
    return wrong.empty()
               ? ""
               : filled(translated("The settings cannot be opened, because their schema {id} is of "
                                   "another version: it does not have {keys} as this program knows "
                                   "it. These directories were searched, the first that has the "
                                   "schema counts: {directories}. Install the program again."),
                        {{"id", id}, {"keys", wrong}, {"directories", searchedDirectories()}});
}

} // namespace

FoundSchemas findSchemas(base::Purpose purpose) {
    FoundSchemas found;
    for (const auto name : schemaNames) {
        const auto id =
            (purpose == base::Purpose::Trial ? trialPrefix : prefix) + std::string(name);
        auto schema = lookUp(id.c_str());
        if (auto problem = problemOf(schema, name, id); !problem.empty()) {
            return {{}, std::move(problem)};
        }
        found.schemas.push_back(std::move(schema));
    }
    return found;
}

} // namespace quorl::preferences
