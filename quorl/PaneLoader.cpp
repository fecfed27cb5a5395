#include "quorl/PaneLoader.h"

#include <algorithm>

#include <QDir>
#include <QFileInfo>

#include "runtime/PluginBundle.h"

namespace quorl {

namespace {

std::filesystem::path programDirectory() {
    return QFileInfo(QStringLiteral("/proc/self/exe")).canonicalPath().toStdString();
}

PaneProblem noBundle(const std::vector<std::filesystem::path>& directories) {
    std::string text = "No plug-in was found. Install the Music plug-in into one of these places:";
    for (const auto& directory : directories) {
        text += "\n" + directory.string();
    }
    return {text};
}

} // namespace

std::vector<std::filesystem::path> pluginDirectories(const std::filesystem::path& preferred) {
    const auto prefix = programDirectory().parent_path();
    const std::filesystem::path home = QDir::homePath().toStdString();
    std::vector<std::filesystem::path> directories;
    for (const auto& directory :
         {preferred, prefix / "lib/quorl/plugins", prefix / QUORL_LIBDIR "/quorl/plugins",
          home / ".local/lib/quorl/plugins"}) {
        if (!directory.empty() && std::ranges::find(directories, directory) == directories.end()) {
            directories.push_back(directory);
        }
    }
    return directories;
}

LoadedPane loadPane(const std::vector<std::filesystem::path>& directories) {
    const auto bundles = findBundles(directories);
    if (bundles.empty()) {
        return noBundle(directories);
    }
    try {
        return PluginBundle::open(bundles.front())->rootClass();
    } catch (const BundleError& error) {
        return PaneProblem{"A plug-in cannot be shown.\n\n" + std::string(error.what())};
    } catch (const std::exception& error) {
        return PaneProblem{"A plug-in cannot be shown.\n\n" + bundles.front().string() + ": " +
                           error.what() + "; install the plug-in again"};
    }
}

} // namespace quorl
