#include "platform/NSBundle.h"

#include <map>
#include <typeinfo>
#include <unordered_map>

#include <dlfcn.h>

#include "runtime/plugins/PluginBundle.h"

namespace {

/// The program itself, and the platform: code without a registration and without texts.
class ProgramBundle final : public NSBundle {
  public:
    [[nodiscard]] std::optional<std::string> bundleIdentifier() const override {
        return std::nullopt;
    }

    [[nodiscard]] std::string
    localizedStringForKey_value_table(const std::string& key,
                                      const std::optional<std::string>& value,
                                      const std::optional<std::string>& /*table*/) const override {
        return value && !value->empty() ? *value : key;
    }
};

std::shared_ptr<NSBundle> bundleAt(const std::filesystem::path& directory) {
    try {
        return quorl::PluginBundle::open(directory);
    } catch (const quorl::BundleError&) {
        return create<ProgramBundle>(); // code that belongs to no plug-in
    }
}

/// One bundle for all classes of a directory.
std::shared_ptr<NSBundle> bundleWithCodeOf(const Class& cls) {
    static auto* const bundles = new std::map<std::filesystem::path, std::shared_ptr<NSBundle>>;
    Dl_info image{};
    if (dladdr(&cls.type(), &image) == 0 || image.dli_fname == nullptr) {
        return create<ProgramBundle>();
    }
    const auto directory = std::filesystem::path(image.dli_fname).parent_path();
    auto& bundle = (*bundles)[directory];
    if (!bundle) {
        bundle = bundleAt(directory);
    }
    return bundle;
}

} // namespace

std::shared_ptr<NSBundle> NSBundle::bundleForClass(const Class& cls) {
    // Loaded code stays where it is for the life of the process, and so do its classes and bundles.
    // Two plug-ins may have a class of one name, but it stands in two places.
    static auto* const bundles =
        new std::unordered_map<const std::type_info*, std::shared_ptr<NSBundle>>;
    auto& bundle = (*bundles)[&cls.type()];
    if (!bundle) {
        bundle = bundleWithCodeOf(cls);
    }
    return bundle;
}
