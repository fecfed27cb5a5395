#pragma once

#include <memory>

#include <gio/gio.h>

namespace quorl::preferences {

/// Frees what a GLib function gave away, with the function that goes with it.
template <auto Free>
struct FreedWith {
    void operator()(auto* pointer) const { Free(pointer); }
};

template <class T>
using ObjectPointer = std::unique_ptr<T, FreedWith<g_object_unref>>;

using BackendPointer = ObjectPointer<GSettingsBackend>;
using ContextPointer = std::unique_ptr<GMainContext, FreedWith<g_main_context_unref>>;
using ErrorPointer = std::unique_ptr<GError, FreedWith<g_error_free>>;
using KeyPointer = std::unique_ptr<GSettingsSchemaKey, FreedWith<g_settings_schema_key_unref>>;
using SchemaPointer = std::unique_ptr<GSettingsSchema, FreedWith<g_settings_schema_unref>>;
using SettingsPointer = ObjectPointer<GSettings>;
using SourcePointer =
    std::unique_ptr<GSettingsSchemaSource, FreedWith<g_settings_schema_source_unref>>;
using VariantPointer = std::unique_ptr<GVariant, FreedWith<g_variant_unref>>;

} // namespace quorl::preferences
