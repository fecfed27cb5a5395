// Asks GIO for the backend interface, which is stable but not part of gio.h.
#define G_SETTINGS_ENABLE_BACKEND
#include "services/preferences/Backend.h"

#include <string_view>
#include <utility>

#include <gio/gsettingsbackend.h>

#include "services/language/Translated.h"

namespace quorl::preferences {

using language::filled;
using language::translated;

namespace {

/// GSettings does not say whether its backend shares anything; the name of the type does.
constexpr std::string_view dconf = "DConfSettingsBackend";

std::string notDconf(const char* backend) {
    const char* const wanted = g_getenv("GSETTINGS_BACKEND");
    if (wanted == nullptr) {
        return filled(
            translated("The settings are not shared with the sync engine and may be lost when the "
                       "program ends, because GSettings keeps them in {backend} instead of dconf. "
                       "Install the package dconf-gsettings-backend and start the program again."),
            {{"backend", backend}});
    }
    return filled(translated("The settings are not shared with the sync engine and may be lost "
                             "when the program ends, because GSettings keeps them in {backend} "
                             "instead of dconf. Unset the environment variable GSETTINGS_BACKEND, "
                             "which asks for “{wanted}”, and start the program again."),
                  {{"backend", backend}, {"wanted", wanted}});
}

std::string noSessionBus(const std::string& reason) {
    return filled(translated("There is no session bus ({reason}). Log in again, or start the "
                             "program with dbus-run-session."),
                  {{"reason", reason}});
}

} // namespace

Backend::Backend(const std::vector<SchemaPointer>& schemas)
    : backend_(g_settings_backend_get_default()) {
    const char* const name = G_OBJECT_TYPE_NAME(backend_.get());
    if (name != dconf) {
        problem_ = notDconf(name);
    } else if (const auto missing = connect(); !missing.empty()) {
        problem_ = filled(translated("The settings are not shared with the sync engine, and "
                                     "changes last only until the program ends. {problem}"),
                          {{"problem", missing}});
        keepInMemory(schemas);
    }
}

void Backend::keepInMemory(const std::vector<SchemaPointer>& schemas) {
    BackendPointer memory(g_memory_settings_backend_new());
    for (const auto& schema : schemas) {
        const SettingsPointer source(g_settings_new_full(schema.get(), backend_.get(), nullptr));
        const SettingsPointer target(g_settings_new_full(schema.get(), memory.get(), nullptr));
        const std::unique_ptr<char*, FreedWith<g_strfreev>> keys(
            g_settings_schema_list_keys(schema.get()));
        for (char** key = keys.get(); *key != nullptr; ++key) {
            if (const VariantPointer value(g_settings_get_user_value(source.get(), *key)); value) {
                g_settings_set_value(target.get(), *key, value.get());
            }
        }
    }
    backend_ = std::move(memory);
}

std::string Backend::connect() {
    if (!problem_.empty()) {
        return {};
    }
    if (bus_ && g_dbus_connection_is_closed(bus_.get()) == FALSE) {
        return {};
    }
    // GIO makes a new connection only when nobody holds the old one any more.
    bus_.reset();
    GError* failure = nullptr;
    bus_.reset(g_bus_get_sync(G_BUS_TYPE_SESSION, nullptr, &failure));
    if (const auto error = ErrorPointer(failure)) {
        return noSessionBus(error->message);
    }
    g_dbus_connection_set_exit_on_close(bus_.get(), FALSE);
    return g_dbus_connection_is_closed(bus_.get()) == FALSE
               ? ""
               : noSessionBus(translated("it went away"));
}

/// The service announces a change only after it has told the writer that it is stored. Whatever is
/// asked of it next, it answers after that. A service that does not run has nothing to announce.
void Backend::awaitAnnouncements() const {
    constexpr int patience = 1000; // milliseconds
    if (bus_) {
        const VariantPointer answer(g_dbus_connection_call_sync(
            bus_.get(), "ca.desrt.dconf", "/ca/desrt/dconf/Writer/user",
            "org.freedesktop.DBus.Properties", "GetAll",
            g_variant_new("(s)", "ca.desrt.dconf.Writer"), nullptr, G_DBUS_CALL_FLAGS_NO_AUTO_START,
            patience, nullptr, nullptr));
    }
}

std::string Backend::storingProblem() {
    if (auto problem = connect(); !problem.empty()) {
        return problem;
    }
    GError* failure = nullptr;
    const VariantPointer started(g_dbus_connection_call_sync(
        bus_.get(), "org.freedesktop.DBus", "/org/freedesktop/DBus", "org.freedesktop.DBus",
        "StartServiceByName", g_variant_new("(su)", "ca.desrt.dconf", 0U), nullptr,
        G_DBUS_CALL_FLAGS_NONE, -1, nullptr, &failure));
    const ErrorPointer error(failure);
    if (!error) {
        return filled(
            translated("The dconf service did not store it. Log in again if it hangs; otherwise "
                       "make room on the disk, and see to it that {directory} may be written and "
                       "that the service runs for the same directory."),
            {{"directory", std::string(g_get_user_config_dir()) + "/dconf"}});
    }
    if (g_dbus_connection_is_closed(bus_.get()) != FALSE) {
        return noSessionBus(error->message);
    }
    return filled(translated("The dconf service does not start ({reason}). Install the package "
                             "dconf-service, or log in again."),
                  {{"reason", error->message}});
}

} // namespace quorl::preferences
