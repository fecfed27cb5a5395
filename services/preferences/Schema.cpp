#include "services/preferences/Schema.h"

#include <filesystem>
#include <system_error>
#include <vector>

#include "services/preferences/Preference.h"
#include "services/preferences/Variant.h"

namespace quorl::preferences {

namespace {

constexpr auto schemaID = "org.quorl.Velora.AssetSync";
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

SchemaPointer lookUp() {
    GSettingsSchemaSource* const usual = g_settings_schema_source_get_default();
    const SourcePointer besideProgram(g_settings_schema_source_new_from_directory(
        directoryBesideProgram().c_str(), usual, FALSE, nullptr));
    GSettingsSchemaSource* const source = besideProgram ? besideProgram.get() : usual;
    return SchemaPointer(
        source == nullptr ? nullptr : g_settings_schema_source_lookup(source, schemaID, TRUE));
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
std::string misfits(GSettingsSchema& schema) {
    std::string text;
    forEachPreference([&]<class T>(const Preference<T>& preference) {
        if (!hasValue(schema, preference.key, Stored<T>::type)) {
            text += (text.empty() ? "" : ", ") + std::string(preference.key);
        }
    });
    return text;
}

} // namespace

FoundSchema findSchema() {
    auto schema = lookUp();
    if (!schema) {
        return {nullptr, std::string("The settings cannot be opened, because their schema ") +
                             schemaID +
                             " is in none of these directories: " + searchedDirectories() +
                             ". Install the program again; or run glib-compile-schemas on the one "
                             "that holds " +
                             schemaID + ".gschema.xml."};
    }
    if (const auto wrong = misfits(*schema); !wrong.empty()) {
        return {nullptr,
                std::string("The settings cannot be opened, because their schema ") + schemaID +
                    " is of another version: it does not have " + wrong +
                    " as this program knows it. These directories were searched, the first "
                    "that has the schema counts: " +
                    searchedDirectories() + ". Install the program again."};
    }
    return {std::move(schema), {}};
}

} // namespace quorl::preferences
