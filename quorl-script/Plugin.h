#pragma once

#include "platform/Inspection.h"
#include "platform/UserInterface.h"
#include "quorl-script/output/Json.h"
#include "runtime/plugins/PluginBundle.h"

namespace quorl {

/// The plug-in under trial and what of its own a script may ask. Main thread; wants an installed
/// host.
class Plugin {
  public:
    /// Loads the first bundle in `directories`. Throws `BundleError` where it cannot be loaded, and
    /// `std::runtime_error` where there is none.
    [[nodiscard]] static Plugin load(const std::vector<std::filesystem::path>& directories);

    /// The class that its registration names.
    [[nodiscard]] const Class& rootClass() const { return rootClass_; }

    /// What the plug-in's table of inspection answers, asked in the table's order. Throws
    /// `CommandError` where the plug-in has no table.
    [[nodiscard]] JsonObject status() const;

    /// A new cell of the class that the plug-in shows its playlists in, never null. Throws
    /// `CommandError` where the plug-in does not offer that class.
    [[nodiscard]] std::shared_ptr<UITableViewCell> newPlaylistCell() const;

  private:
    Plugin(std::shared_ptr<PluginBundle> bundle, const Class& rootClass)
        : bundle_(std::move(bundle)), rootClass_(rootClass) {}

    [[noreturn]] void refuse(const std::string& wanted) const;

    std::shared_ptr<PluginBundle> bundle_;
    Class rootClass_;
};

} // namespace quorl
