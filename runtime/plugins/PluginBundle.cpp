#include "runtime/plugins/PluginBundle.h"

#include <algorithm>
#include <cstdlib>

#include <dlfcn.h>
#include <nlohmann/json.hpp>

#include "platform/InterfaceVersion.h"
#include "runtime/host/Host.h"
#include "runtime/plugins/SharedObjectFile.h"

namespace quorl {

namespace {

using nlohmann::json;

std::string textField(const json& object, const char* name, const std::filesystem::path& file) {
    const auto field = object.find(name);
    if (field == object.end() || !field->is_string() || field->get<std::string>().empty()) {
        throw BundleError(file, std::string("the field \"") + name +
                                    "\" is missing or not a text; install the plug-in again");
    }
    return field->get<std::string>();
}

json readObject(const std::filesystem::path& file) {
    constexpr std::size_t maximumBytes = std::size_t{1} << 20;
    auto object = json::parse(readBundleFile(file, maximumBytes), nullptr, false);
    if (!object.is_object()) {
        throw BundleError(file, "this file is damaged: it is not a JSON object; "
                                "install the plug-in again");
    }
    return object;
}

Digests digests(const json& object, const std::filesystem::path& file) {
    const auto field = object.find("sha256");
    const bool isTexts =
        field != object.end() && field->is_object() &&
        std::ranges::all_of(*field, [](const json& digest) { return digest.is_string(); });
    if (!isTexts) {
        throw BundleError(file, "the field \"sha256\" is missing or not an object of texts; "
                                "install the plug-in again");
    }
    return field->get<Digests>();
}

json numberField(const json& object, const char* name, const std::filesystem::path& file) {
    const auto field = object.find(name);
    if (field == object.end() || !field->is_number_integer()) {
        throw BundleError(file, std::string("the field \"") + name +
                                    "\" is missing or not a whole number; "
                                    "install the plug-in again");
    }
    return *field;
}

/// Registrations of the first minor version of an interface say nothing of it.
json minorVersion(const json& object, const std::filesystem::path& file) {
    constexpr auto name = "interfaceMinorVersion";
    return object.contains(name) ? numberField(object, name, file) : json(0);
}

/// A plug-in knows nothing of what came after it, and needs all that came before.
void takeVersion(const json& object, Registration& registration,
                 const std::filesystem::path& file) {
    const json version = numberField(object, "interfaceVersion", file);
    const json minor = minorVersion(object, file);
    const std::pair built(version.get<double>(), minor.get<double>()); // for numbers of any size
    const std::pair<double, double> own(QuorlInterfaceVersion, QuorlInterfaceMinorVersion);
    if (built > own || built.first != own.first || built.second < 0) {
        throw BundleError(file, "it was built against version " + version.dump() + "." +
                                    minor.dump() + " of the interface and this app has version " +
                                    std::to_string(QuorlInterfaceVersion) + "." +
                                    std::to_string(QuorlInterfaceMinorVersion) + "; update the " +
                                    (built > own ? "app" : "plug-in") +
                                    ", or install the plug-in and the app from one release");
    }
    registration.interfaceVersion = version.get<int>();
    registration.interfaceMinorVersion = minor.get<int>();
}

/// The directories named `name` of what is installed with this program, and of the user; each once.
std::vector<std::filesystem::path> installedDirectories(const std::filesystem::path& name) {
    std::error_code ignored; // without /proc the other places remain
    const auto program = std::filesystem::read_symlink("/proc/self/exe", ignored);
    const auto prefix = program.parent_path().parent_path();
    const char* const home = std::getenv("HOME");
    std::vector<std::filesystem::path> directories;
    for (const auto& place : {prefix / "lib", prefix / QUORL_LIBDIR,
                              std::filesystem::path(home ? home : "") / ".local/lib"}) {
        const auto directory = place / "quorl" / name;
        if (std::ranges::find(directories, directory) == directories.end()) {
            directories.push_back(directory);
        }
    }
    return directories;
}

} // namespace

std::shared_ptr<PluginBundle> PluginBundle::open(const std::filesystem::path& directory) {
    const auto file = directory / "registration.json";
    const json object = readObject(file);
    Registration registration;
    takeVersion(object, registration, file);
    registration.identifier = textField(object, "identifier", file);
    registration.rootClass = textField(object, "rootClass", file);
    registration.library = textField(object, "library", file);
    if (registration.library.find('/') != std::string::npos) {
        throw BundleError(file, "the field \"library\" must name a file of the bundle itself; "
                                "install the plug-in again");
    }
    registration.digests = digests(object, file);
    return std::make_shared<PluginBundle>(directory, std::move(registration));
}

PluginBundle::PluginBundle(std::filesystem::path directory, Registration registration)
    : directory_(std::move(directory)),
      registration_(std::move(registration)),
      files_(directory_, registration_.digests),
      strings_(files_) {}

void PluginBundle::load() const {
    if (handle_) {
        return;
    }
    (void)files_.read(registration_.library);
    const auto file = std::filesystem::absolute(directory_ / registration_.library);
    if (const auto problem = problemOfSharedObject(file)) {
        throw BundleError(file, *problem);
    }
    handle_ = dlopen(file.c_str(), RTLD_NOW | RTLD_LOCAL | RTLD_NODELETE);
    if (!handle_) {
        const char* reason = dlerror();
        throw BundleError(file, std::string("this file cannot be loaded (") +
                                    (reason ? reason : "no reason given") +
                                    "); install the plug-in again");
    }
}

Class PluginBundle::rootClass() const {
    load();
    const Class* root = exportedClass(registration_.rootClass);
    if (!root) {
        throw BundleError(directory_ / registration_.library,
                          "it does not offer the class \"" + registration_.rootClass +
                              "\" that its registration names; install the plug-in again");
    }
    return *root;
}

const Class* PluginBundle::exportedClass(const std::string& name) const {
    return static_cast<const Class*>(symbol("QuorlClass_" + name));
}

void* PluginBundle::symbol(const std::string& name) const {
    return handle_ ? dlsym(handle_, name.c_str()) : nullptr;
}

std::optional<std::string> PluginBundle::bundleIdentifier() const {
    return registration_.identifier;
}

std::string
PluginBundle::localizedStringForKey_value_table(const std::string& key,
                                                const std::optional<std::string>& value,
                                                const std::optional<std::string>& table) const {
    Host& host = Host::required();
    const auto text = table ? strings_.text(host.languages(), *table, key)
                            : host.textForKey(strings_, key, value);
    if (text) {
        return *text;
    }
    return value && !value->empty() ? *value : key;
}

std::vector<std::filesystem::path> pluginDirectories(const std::filesystem::path& preferred) {
    std::vector<std::filesystem::path> directories;
    if (!preferred.empty()) {
        directories.push_back(preferred);
    }
    for (const auto& directory : installedDirectories("plugins")) {
        if (directory != preferred) {
            directories.push_back(directory);
        }
    }
    return directories;
}

std::vector<std::filesystem::path> paneDirectories() { return installedDirectories("panes"); }

std::vector<std::filesystem::path>
findBundles(const std::vector<std::filesystem::path>& directories) {
    std::vector<std::filesystem::path> bundles;
    for (const auto& directory : directories) {
        const auto first = static_cast<std::ptrdiff_t>(bundles.size());
        std::error_code ignored; // a directory that is not there holds none
        for (const auto& entry : std::filesystem::directory_iterator(directory, ignored)) {
            if (entry.path().extension() == ".bundle" && entry.is_directory(ignored)) {
                bundles.push_back(entry.path());
            }
        }
        std::sort(bundles.begin() + first, bundles.end());
    }
    return bundles;
}

} // namespace quorl
