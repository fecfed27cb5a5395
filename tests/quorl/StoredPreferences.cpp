#include "tests/quorl/StoredPreferences.h"

#include <QProcess>
#include <stdexcept>

namespace quorl::tests {

namespace {

constexpr int patience = 60'000; // milliseconds

QString schemaOf(const QString& key) {
    return key == QStringLiteral("music-folder") || key == QStringLiteral("wearable-directory")
               ? QStringLiteral("org.quorl.Velora.Places")
               : QStringLiteral("org.quorl.Velora.AssetSync");
}

std::string gsettings(const char* command, const QStringList& arguments) {
    QProcess process;
    process.start(QStringLiteral("gsettings"),
                  QStringList{QStringLiteral("--schemadir"), QStringLiteral(SCHEMA_DIRECTORY),
                              QString::fromLatin1(command), schemaOf(arguments.front())} +
                      arguments);
    if (!process.waitForFinished(patience) || process.exitCode() != 0) {
        throw std::runtime_error("gsettings: " + process.readAllStandardError().toStdString());
    }
    return process.readAllStandardOutput().trimmed().toStdString();
}

} // namespace

std::string storedPreference(const std::string& key) {
    return gsettings("get", {QString::fromStdString(key)});
}

void storePreference(const std::string& key, const std::string& value) {
    gsettings("set", {QString::fromStdString(key), QString::fromStdString(value)});
}

} // namespace quorl::tests
