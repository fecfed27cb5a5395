#include "quorl/app/PaneLoader.h"

#include <set>

#include "runtime/plugins/PluginBundle.h"
#include "services/language/Translated.h"

namespace quorl {

using language::translated;

namespace {

PaneProblem noBundle(const std::vector<std::filesystem::path>& directories) {
    auto text =
        translated("No plug-in was found. Install the Music plug-in into one of these places:");
    for (const auto& directory : directories) {
        text += "\n" + directory.string();
    }
    return {text};
}

LoadedPane paneOf(const std::filesystem::path& bundle) {
    try {
        return PluginBundle::open(bundle)->rootClass();
    } catch (const BundleError& error) {
        return PaneProblem{translated("A plug-in cannot be shown.") + "\n\n" + error.what()};
    } catch (const std::exception& error) {
        return PaneProblem{
            translated("A plug-in cannot be shown.") + "\n\n" +
            language::filled(translated("{file}: {reason}; install the plug-in again"),
                             {{"file", bundle.string()}, {"reason", error.what()}})};
    }
}

} // namespace

LoadedPane loadPane(const std::vector<std::filesystem::path>& directories) {
    const auto bundles = findBundles(directories);
    return bundles.empty() ? noBundle(directories) : paneOf(bundles.front());
}

std::vector<LoadedPane> loadPanes(const std::vector<std::filesystem::path>& directories) {
    std::vector<LoadedPane> panes;
    std::set<std::filesystem::path> names;
    for (const auto& bundle : findBundles(directories)) {
        if (names.insert(bundle.filename()).second) {
            panes.push_back(paneOf(bundle));
        }
    }
    return panes;
}

} // namespace quorl
