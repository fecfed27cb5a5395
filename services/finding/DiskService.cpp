#include "services/finding/DiskService.h"

#include <chrono>
#include <map>
#include <string_view>
#include <utility>

#include <sys/sysmacros.h>

#include "services/base/Utf8.h"
#include "services/language/Translated.h"

namespace quorl::finding {

using language::toTranslate;

namespace {

constexpr auto service = "org.freedesktop.UDisks2";
constexpr auto managerPath = "/org/freedesktop/UDisks2";
constexpr auto blockInterface = "org.freedesktop.UDisks2.Block";
constexpr auto fileSystemInterface = "org.freedesktop.UDisks2.Filesystem";
constexpr auto driveInterface = "org.freedesktop.UDisks2.Drive";

constexpr std::chrono::seconds patience{3};
/// What a slow stick still has to write down, and what a person has to answer.
constexpr std::chrono::minutes patienceForRemoval{5};

using Properties = std::map<std::string, sdbus::Variant>;
using Interfaces = std::map<std::string, Properties>;
using Objects = std::map<sdbus::ObjectPath, Interfaces>;

/// Null where the object is not there or has no such interface.
const Properties* propertiesOf(const Objects& objects, const std::string& path,
                               const char* interface) {
    const auto object = objects.find(sdbus::ObjectPath(path));
    if (object == objects.end()) {
        return nullptr;
    }
    const auto found = object->second.find(interface);
    return found == object->second.end() ? nullptr : &found->second;
}

/// The default of the type where the service says something else.
template <class T>
T valueOf(const Properties& properties, const char* name) {
    const auto found = properties.find(name);
    return found != properties.end() && found->second.containsValueOfType<T>()
               ? found->second.get<T>()
               : T();
}

/// A path, which the service gives as bytes with a zero at the end.
std::string pathOf(const Properties& properties, const char* name) {
    const auto bytes = valueOf<std::vector<std::uint8_t>>(properties, name);
    const std::string text(bytes.begin(), bytes.end());
    return text.substr(0, text.find('\0'));
}

std::string deviceOf(const Properties& block) {
    const auto number = valueOf<std::uint64_t>(block, "DeviceNumber");
    return std::to_string(major(number)) + ':' + std::to_string(minor(number));
}

/// What is encrypted is on the drive of what it is encrypted in.
std::string drivePathOf(const Objects& objects, const Properties& block) {
    const auto backing = valueOf<sdbus::ObjectPath>(block, "CryptoBackingDevice");
    const auto* const holder = propertiesOf(objects, backing, blockInterface);
    return valueOf<sdbus::ObjectPath>(holder == nullptr ? block : *holder, "Drive");
}

bool isPluggable(const Properties& block, const Properties* drive) {
    if (drive == nullptr) {
        return false;
    }
    const auto bus = valueOf<std::string>(*drive, "ConnectionBus");
    return valueOf<bool>(*drive, "Removable") || valueOf<bool>(*drive, "MediaRemovable") ||
           bus == "usb" || (bus == "sdio" && !valueOf<bool>(block, "HintSystem"));
}

Removal::Way wayOf(const Properties* drive) {
    if (drive != nullptr && valueOf<bool>(*drive, "Ejectable")) {
        return Removal::Way::Eject;
    }
    return drive != nullptr && valueOf<bool>(*drive, "CanPowerOff") ? Removal::Way::PowerOff
                                                                    : Removal::Way::Unmount;
}

Drive driveAt(const Objects& objects, const std::string& path, const Properties& block) {
    const auto drivePath = drivePathOf(objects, block);
    const auto* const drive = propertiesOf(objects, drivePath, driveInterface);
    Drive found{deviceOf(block),
                pathOf(block, "Device"),
                valueOf<std::string>(block, "IdUUID"),
                valueOf<std::string>(block, "IdLabel"),
                isPluggable(block, drive),
                {}};
    if (found.isPluggable) {
        found.removal = Removal{path, drivePath, wayOf(drive)};
    }
    return found;
}

void call(sdbus::IConnection& bus, const std::string& path, const char* interface,
          const char* method) {
    sdbus::createProxy(bus, service, path)
        ->callMethod(method)
        .onInterface(interface)
        .withTimeout(patienceForRemoval)
        .withArguments(Properties());
}

void takeAway(sdbus::IConnection& bus, const Removal& removal) {
    call(bus, removal.fileSystem, fileSystemInterface, "Unmount");
    if (removal.way != Removal::Way::Unmount) {
        call(bus, removal.drive, driveInterface,
             removal.way == Removal::Way::Eject ? "Eject" : "PowerOff");
    }
}

std::string sentenceOf(const sdbus::Error& error, const std::string& name) {
    const std::string_view kind = error.getName();
    const auto* const pattern =
        kind.ends_with(".DeviceBusy")
            ? toTranslate(
                  "“{name}” is still in use. Close what is open on it, then eject it again.")
        : kind.find(".NotAuthorized") != std::string_view::npos
            ? toTranslate(
                  "You are not allowed to eject “{name}”. Ask who administers this machine.")
            : toTranslate(
                  "“{name}” could not be ejected: {reason} Leave it plugged in, and try again.");
    return language::filled(
        language::translated(pattern),
        {{"name", base::printable(name)}, {"reason", base::printable(error.getMessage())}});
}

} // namespace

std::vector<Drive> drivesOf(sdbus::IConnection& bus) {
    Objects objects;
    sdbus::createProxy(bus, service, managerPath)
        ->callMethod("GetManagedObjects")
        .onInterface("org.freedesktop.DBus.ObjectManager")
        .withTimeout(patience)
        .storeResultsTo(objects);
    std::vector<Drive> drives;
    for (const auto& [path, interfaces] : objects) {
        const auto* const block = propertiesOf(objects, path, blockInterface);
        if (block != nullptr && interfaces.contains(fileSystemInterface)) {
            drives.push_back(driveAt(objects, path, *block));
        }
    }
    return drives;
}

void watchService(sdbus::IConnection& bus, const std::function<void()>& changed) {
    const auto tell = [changed](sdbus::Message& /*message*/) { changed(); };
    bus.addMatch(std::string("type='signal',sender='") + service + "',path_namespace='" +
                     managerPath + "'",
                 tell, sdbus::floating_slot);
    bus.addMatch(std::string("type='signal',sender='org.freedesktop.DBus',"
                             "member='NameOwnerChanged',arg0='") +
                     service + "'",
                 tell, sdbus::floating_slot);
}

std::string remove(const Removal& removal, const std::string& name, const Connect& connect) {
    try {
        const auto bus = connect();
        takeAway(*bus, removal);
        return {};
    } catch (const sdbus::Error& error) {
        return sentenceOf(error, name);
    }
}

} // namespace quorl::finding
