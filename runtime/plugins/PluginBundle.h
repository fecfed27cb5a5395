#pragma once

#include <filesystem>

#include "platform/Foundation.h"
#include "runtime/plugins/BundleError.h"
#include "runtime/plugins/BundleFiles.h"
#include "runtime/plugins/StringTable.h"

namespace quorl {

/// What a bundle says of itself in its file `registration.json`.
struct Registration {
    std::string identifier; ///< reverse-domain, one of its own for each bundle
    std::string rootClass;
    std::string library; ///< the shared object, a file of the bundle's directory
    int interfaceVersion = 0;
    int interfaceMinorVersion = 0;
    /// Of every other file of the bundle. What is not among them is not used: a bundle without
    /// digests is refused, though its interface version, which is about declarations, may fit.
    Digests digests;
};

/// A plug-in: a directory named `*.bundle` with a registration, a shared object and string tables.
class PluginBundle : public NSBundle {
  public:
    /// Reads and checks the registration; nothing is loaded. Throws `BundleError` where it is
    /// missing, malformed, or made for a version of the platform's interface that this program does
    /// not have.
    [[nodiscard]] static std::shared_ptr<PluginBundle> open(const std::filesystem::path& directory);

    /// Made by `open`.
    PluginBundle(std::filesystem::path directory, Registration registration);

    [[nodiscard]] const std::filesystem::path& directory() const { return directory_; }

    [[nodiscard]] const Registration& registration() const { return registration_; }

    /// The class that the registration names, loaded from the shared object at the first call. Code
    /// that was loaded stays for the life of the process. Throws `BundleError` where the shared
    /// object is missing, damaged, not the one that was made with the registration, cannot be
    /// loaded, or does not offer that class.
    [[nodiscard]] Class rootClass() const;

    /// A class that the shared object, which `rootClass` has loaded, exports under this name; null
    /// where it exports none.
    [[nodiscard]] const Class* exportedClass(const std::string& name) const;

    /// The address of a symbol of the shared object, which `rootClass` has loaded; null where it
    /// has none of that name.
    [[nodiscard]] void* symbol(const std::string& name) const;

    [[nodiscard]] std::optional<std::string> bundleIdentifier() const override;
    [[nodiscard]] std::string
    localizedStringForKey_value_table(const std::string& key,
                                      const std::optional<std::string>& value,
                                      const std::optional<std::string>& table) const override;

  private:
    void load() const;

    std::filesystem::path directory_;
    Registration registration_;
    BundleFiles files_;
    StringTable strings_;
    mutable void* handle_ = nullptr;
};

/// The directories that plug-ins are looked for in, the first one first: `preferred` unless it is
/// empty, then those beside this program's own directory, then that of the user.
[[nodiscard]] std::vector<std::filesystem::path>
pluginDirectories(const std::filesystem::path& preferred);

/// The directories that further panes are looked for in, in the same order.
[[nodiscard]] std::vector<std::filesystem::path> paneDirectories();

/// The directories named `*.bundle` in `directories`, in the order of those and then by name. A
/// directory that does not exist holds none.
[[nodiscard]] std::vector<std::filesystem::path>
findBundles(const std::vector<std::filesystem::path>& directories);

} // namespace quorl
