#include "quorl-script/Plugin.h"

#include "quorl-script/input/Field.h"

namespace quorl {

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

JsonObject Plugin::status() const {
    const auto* table = static_cast<const QuorlInspection*>(bundle_->symbol(QuorlInspectionSymbol));
    if (!table) {
        refuse(QuorlInspectionSymbol);
    }
    JsonObject status;
    status.set("stage", table->syncStage())
        .set("progress", table->progress())
        .set("completedAssetCount", table->completedAssetCount())
        .set("totalAssetCount", table->totalAssetCount());
    const auto playlist = table->assetSyncPlaylist();
    status.set("assetSyncPlaylist",
               playlist ? Json(std::to_string(playlist->persistentID())) : Json(nullptr));
    return status;
}

std::shared_ptr<UITableViewCell> Plugin::newPlaylistCell() const {
    const Class* cellClass = bundle_->exportedClass(QuorlPlaylistCellClassName);
    auto cell =
        cellClass ? std::dynamic_pointer_cast<UITableViewCell>(cellClass->create()) : nullptr;
    if (!cell) {
        refuse(QuorlPlaylistCellClassName);
    }
    return cell;
}

void Plugin::refuse(const std::string& wanted) const {
    throw CommandError(bundle_->directory().string() + ": this plug-in does not show its \"" +
                       wanted + "\", which the command wants; try it with a plug-in that does");
}

} // namespace quorl
