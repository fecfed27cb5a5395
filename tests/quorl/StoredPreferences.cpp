#include "tests/quorl/StoredPreferences.h"

#include <QProcess>
#include <stdexcept>

namespace quorl::tests {

namespace {

constexpr int patience = 60'000; // milliseconds

QString schemaOf(const QString& key, base::Purpose purpose) {
    const bool isPlace =
        key == QStringLiteral("music-folder") || key.startsWith(QStringLiteral("wearable-"));
    const bool isNotice = key == QStringLiteral("desktop-notices");
    return (purpose == base::Purpose::Trial ? QStringLiteral("org.quorl.Velora.Trial.")
                                            : QStringLiteral("org.quorl.Velora.")) +
           (isPlace    ? QStringLiteral("Places")
            : isNotice ? QStringLiteral("Notices")
                       : QStringLiteral("AssetSync"));
}

std::string gsettings(const char* command, base::Purpose purpose, const QStringList& arguments) {
    QProcess process;
    process.start(QStringLiteral("gsettings"),
                  QStringList{QStringLiteral("--schemadir"), QStringLiteral(SCHEMA_DIRECTORY),
                              QString::fromLatin1(command), schemaOf(arguments.front(), purpose)} +
                      arguments);
    if (!process.waitForFinished(patience) || process.exitCode() != 0) {
        throw std::runtime_error("gsettings: " + process.readAllStandardError().toStdString());
    }
    return process.readAllStandardOutput().trimmed().toStdString();
}

} // namespace

std::string storedPreference(const std::string& key, base::Purpose purpose) {
    return gsettings("get", purpose, {QString::fromStdString(key)});
}

void storePreference(const std::string& key, const std::string& value) {
    gsettings("set", base::Purpose::Use,
              {QString::fromStdString(key), QString::fromStdString(value)});
}

} // namespace quorl::tests
