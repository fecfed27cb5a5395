#include "quorl/window/desktop/Guide.h"

#include <QCoreApplication>
#include <QFileInfo>
#include <QStandardPaths>
#include <algorithm>
#include <memory>

#include <gio/gio.h>

namespace quorl {

namespace {

struct Release {
    void operator()(gpointer object) const { g_object_unref(object); }
};

/// Beside the program, or wherever this session has its manuals.
bool isManualInstalled() {
    QStringList folders = QStandardPaths::standardLocations(QStandardPaths::GenericDataLocation);
    folders << QCoreApplication::applicationDirPath() + QStringLiteral("/../share");
    return std::any_of(folders.begin(), folders.end(), [](const QString& folder) {
        const QString page = folder + QStringLiteral("/man/man1/quorl.1");
        return QFileInfo::exists(page) || QFileInfo::exists(page + QStringLiteral(".gz"));
    });
}

} // namespace

bool openGuide() {
    const std::unique_ptr<GAppInfo, Release> reader(
        isManualInstalled() ? g_app_info_get_default_for_uri_scheme("man") : nullptr);
    if (!reader) {
        return false;
    }
    const char page[] = "man:quorl(1)";
    GList pages{const_cast<char*>(page), nullptr, nullptr};
    return g_app_info_launch_uris(reader.get(), &pages, nullptr, nullptr) != FALSE;
}

} // namespace quorl
