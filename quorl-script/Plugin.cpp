#include "quorl-script/Plugin.h"

#include "platform/MediaLibrary.h"
#include "platform/SyncPreferences.h"
#include "quorl-script/Field.h"

// The plug-in's own; only it knows what is inside.
class LMQuorlSyncManager;

namespace quorl {

namespace {

// What the plug-in's functions are called in its shared object, and their types. A method is a
// function of the object that it is sent to.
namespace symbols {

constexpr const char* sharedManager = "_ZN18LMQuorlSyncManager13sharedManagerEv";
constexpr const char* syncStage = "_ZNK18LMQuorlSyncManager9syncStageEv";
constexpr const char* progress = "_ZNK18LMQuorlSyncManager8progressEv";
constexpr const char* completedAssetCount = "_ZNK18LMQuorlSyncManager19completedAssetCountEv";
constexpr const char* totalAssetCount = "_ZNK18LMQuorlSyncManager15totalAssetCountEv";
constexpr const char* assetSyncPlaylist = "_Z17assetSyncPlaylistR14LMSyncDefaults";
constexpr const char* layoutSubviews = "_ZN19LMQuorlPlaylistCell14layoutSubviewsEv";
} // namespace symbols

using SharedManager = const std::shared_ptr<LMQuorlSyncManager>&();
using IntegerOfManager = NSInteger(const LMQuorlSyncManager*);
using FloatOfManager = float(const LMQuorlSyncManager*);
using CountOfManager = NSUInteger(const LMQuorlSyncManager*);
using PlaylistOfDefaults = std::shared_ptr<MPMediaPlaylist>(LMSyncDefaults&);
using LayOutCell = void(UITableViewCell*);

} // namespace

Plugin Plugin::load(const std::vector<std::filesystem::path>& directories) {
    const auto bundles = findBundles(directories);
    if (bundles.empty()) {
        std::string text = "no plug-in was found; install it into one of these places:";
        for (const auto& directory : directories) {
            text += "\n" + directory.string();
        }
        throw std::runtime_error(text);
    }
    auto bundle = PluginBundle::open(bundles.front());
    const Class rootClass = bundle->rootClass();
    return {std::move(bundle), rootClass};
}

Json Plugin::status() const {
    const auto& manager = *function<SharedManager>(symbols::sharedManager)();
    Json status;
    status["stage"] = function<IntegerOfManager>(symbols::syncStage)(&manager);
    status["progress"] = function<FloatOfManager>(symbols::progress)(&manager);
    status["completedAssetCount"] =
        function<CountOfManager>(symbols::completedAssetCount)(&manager);
    status["totalAssetCount"] = function<CountOfManager>(symbols::totalAssetCount)(&manager);
    const auto playlist =
        function<PlaylistOfDefaults>(symbols::assetSyncPlaylist)(LMSyncDefaults::sharedDefaults());
    status["assetSyncPlaylist"] =
        playlist ? Json(std::to_string(playlist->persistentID())) : Json(nullptr);
    return status;
}

void Plugin::layOutPlaylistCell(UITableViewCell& cell) const {
    // The class adds nothing but this method to the cell, so a plain cell will do.
    function<LayOutCell>(symbols::layoutSubviews)(&cell);
}

template <class Function>
Function* Plugin::function(const char* symbol) const {
    auto* const address = bundle_->symbol(symbol);
    if (!address) {
        throw CommandError(bundle_->directory().string() +
                           ": this plug-in has no function for that command (" + symbol +
                           "); try it with the plug-in of the same release");
    }
    return reinterpret_cast<Function*>(address);
}

} // namespace quorl
