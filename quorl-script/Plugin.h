#pragma once

#include "platform/UserInterface.h"
#include "quorl-script/Trace.h"
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

    /// The answers of the plug-in's sync status manager, and the id of the synced playlist. Throws
    /// `CommandError` where the plug-in has no such objects.
    [[nodiscard]] Json status() const;

    /// The plug-in's layout of a playlist cell, applied to `cell`. Throws `CommandError` where it
    /// has none.
    void layOutPlaylistCell(UITableViewCell& cell) const;

  private:
    Plugin(std::shared_ptr<PluginBundle> bundle, const Class& rootClass)
        : bundle_(std::move(bundle)), rootClass_(rootClass) {}

    /// The function of the plug-in that the linker knows by `symbol`.
    template <class Function>
    [[nodiscard]] Function* function(const char* symbol) const;

    std::shared_ptr<PluginBundle> bundle_;
    Class rootClass_;
};

} // namespace quorl
