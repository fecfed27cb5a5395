#include "quorl/app/PaneLoader.h"

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

} // namespace

LoadedPane loadPane(const std::vector<std::filesystem::path>& directories) {
    const auto bundles = findBundles(directories);
    if (bundles.empty()) {
        return noBundle(directories);
    }
    try {
        return PluginBundle::open(bundles.front())->rootClass();
    } catch (const BundleError& error) {
        return PaneProblem{translated("A plug-in cannot be shown.") + "\n\n" + error.what()};
    } catch (const std::exception& error) {
        return PaneProblem{translated("A plug-in cannot be shown.") + "\n\n" +
                           bundles.front().string() + ": " + error.what() +
                           "; install the plug-in again"};
    }
}

} // namespace quorl
