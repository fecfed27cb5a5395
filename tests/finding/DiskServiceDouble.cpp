#include "tests/finding/DiskServiceDouble.h"

namespace quorl::finding::test {

namespace {

using Options = std::map<std::string, sdbus::Variant>;

constexpr auto managerPath = "/org/freedesktop/UDisks2";
constexpr auto blockInterface = "org.freedesktop.UDisks2.Block";
constexpr auto fileSystemInterface = "org.freedesktop.UDisks2.Filesystem";
constexpr auto driveInterface = "org.freedesktop.UDisks2.Drive";

std::vector<std::uint8_t> bytesOf(const std::string& text) {
    std::vector<std::uint8_t> bytes(text.begin(), text.end());
    bytes.push_back(0);
    return bytes;
}

template <class T>
void addProperty(sdbus::IObject& object, const char* interface, const char* name, const T& value) {
    object.registerProperty(name).onInterface(interface).withGetter([value] { return value; });
}

} // namespace

struct DiskServiceDouble::Stick {
    std::unique_ptr<sdbus::IObject> block;
    std::unique_ptr<sdbus::IObject> drive;
};

DiskServiceDouble::DiskServiceDouble()
    : connection_(sdbus::createSessionBusConnectionWithAddress(bus_.address())) {
    connection_->addObjectManager(managerPath, sdbus::floating_slot);
    connection_->requestName("org.freedesktop.UDisks2");
    connection_->enterEventLoopAsync();
}

DiskServiceDouble::~DiskServiceDouble() = default;

void DiskServiceDouble::plugIn(const std::string& uuid, const std::string& label,
                               std::uint64_t number) {
    auto stick = std::make_unique<Stick>();
    const std::string drivePath = std::string(managerPath) + "/drives/" + uuid;
    stick->drive = sdbus::createObject(*connection_, drivePath);
    addProperty(*stick->drive, driveInterface, "Removable", true);
    addProperty(*stick->drive, driveInterface, "Ejectable", true);
    stick->drive->registerMethod("Eject")
        .onInterface(driveInterface)
        .implementedAs([this, uuid](const Options&) { note("Eject " + uuid); });
    stick->drive->finishRegistration();

    stick->block = sdbus::createObject(*connection_, managerPath + ("/block_devices/" + uuid));
    auto& block = *stick->block;
    addProperty(block, blockInterface, "Device", bytesOf("/dev/" + uuid));
    addProperty(block, blockInterface, "DeviceNumber", number);
    addProperty(block, blockInterface, "IdUUID", uuid);
    addProperty(block, blockInterface, "IdLabel", label);
    addProperty(block, blockInterface, "Drive", sdbus::ObjectPath(drivePath));
    block.registerMethod("Unmount")
        .onInterface(fileSystemInterface)
        .implementedAs([this, uuid](const Options&) { note("Unmount " + uuid); });
    block.finishRegistration();
    stick->drive->emitInterfacesAddedSignal();
    block.emitInterfacesAddedSignal();
    sticks_[uuid] = std::move(stick);
}

void DiskServiceDouble::pullOut(const std::string& uuid) {
    sticks_.at(uuid)->block->emitInterfacesRemovedSignal();
    sticks_.erase(uuid);
}

void DiskServiceDouble::failWith(const std::string& error) {
    const std::scoped_lock lock(mutex_);
    error_ = error;
}

std::vector<std::string> DiskServiceDouble::asked() const {
    const std::scoped_lock lock(mutex_);
    return asked_;
}

Connect DiskServiceDouble::connect() const {
    return [address = bus_.address()] {
        return sdbus::createSessionBusConnectionWithAddress(address);
    };
}

void DiskServiceDouble::note(const std::string& what) {
    const std::scoped_lock lock(mutex_);
    if (!error_.empty()) {
        throw sdbus::Error("org.freedesktop.UDisks2.Error." + error_, "It says " + error_ + ".");
    }
    asked_.push_back(what);
}

} // namespace quorl::finding::test
