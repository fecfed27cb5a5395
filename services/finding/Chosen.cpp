#include "services/finding/Chosen.h"

#include "services/base/Paths.h"
#include "services/wearable/Unseen.h"

namespace quorl::finding {

namespace {

/// Where all of the file system is mounted rather than a part of it; null where none is.
const base::Mount* mountWith(const std::string& uuid, const Surroundings& surroundings) {
    const base::Mount* found = nullptr;
    for (const auto& mount : surroundings.mounts) {
        const auto* const drive = driveOf(mount, surroundings.drives);
        const bool isIt = drive != nullptr && drive->uuid == uuid;
        if (isIt && (found == nullptr || (found->root != "/" && mount.root == "/"))) {
            found = &mount;
        }
    }
    return found;
}

std::filesystem::path onMount(const base::Mount& mount, const Chosen& chosen) {
    const auto within = chosen.directory.lexically_relative(chosen.identity->mountPoint);
    return within == "." ? mount.directory : mount.directory / within;
}

/// Where the drive is not mounted.
Whereabouts missing(const Chosen& chosen, const Surroundings& surroundings) {
    const auto* const mount = base::mountOver(chosen.directory, surroundings.mounts);
    const auto* const drive = mount == nullptr ? nullptr : driveOf(*mount, surroundings.drives);
    const auto& before = chosen.identity->mountPoint;
    if (mount == nullptr || !base::isWithin(mount->directory.native(), before.native())) {
        return {chosen.directory, {wearable::unseen::notPluggedIn}};
    }
    const bool isUnknown = drive == nullptr || drive->uuid.empty();
    const bool isDevice = !mount->device.starts_with("0:") || mount->source.starts_with("/dev/");
    if (isUnknown && isDevice) {
        return {chosen.directory};
    }
    const auto name = drive == nullptr ? std::string() : drive->label;
    return {chosen.directory, {wearable::unseen::otherDrive, {mount->directory.string(), name}}};
}

} // namespace

std::string toText(const std::optional<Identity>& identity) {
    return identity ? identity->uuid + ':' + identity->mountPoint.string() : std::string();
}

std::optional<Identity> parseIdentity(std::string_view text) {
    const auto separator = text.find(":/");
    return separator == 0 || separator == std::string_view::npos
               ? std::nullopt
               : std::optional(Identity{std::string(text.substr(0, separator)),
                                        base::normal(text.substr(separator + 1))});
}

Chosen chosenIn(const std::filesystem::path& directory, std::string_view identity) {
    Chosen chosen{directory.empty() ? directory : base::normal(directory), parseIdentity(identity)};
    if (chosen.identity &&
        !base::isWithin(chosen.directory.native(), chosen.identity->mountPoint.native())) {
        chosen.identity.reset();
    }
    return chosen;
}

Chosen chosenAt(const std::filesystem::path& directory, const Surroundings& surroundings) {
    const auto* const mount =
        directory.empty() ? nullptr : base::mountOver(directory, surroundings.mounts);
    const auto* const drive = mount == nullptr ? nullptr : driveOf(*mount, surroundings.drives);
    if (drive == nullptr || !drive->isPluggable || drive->uuid.empty()) {
        return {directory, {}};
    }
    return {directory, Identity{drive->uuid, mount->directory}};
}

Whereabouts whereaboutsOf(const Chosen& chosen, const Surroundings& surroundings) {
    if (!chosen.identity) {
        return {chosen.directory};
    }
    const auto* const over = base::mountOver(chosen.directory, surroundings.mounts);
    const auto* const drive = over == nullptr ? nullptr : driveOf(*over, surroundings.drives);
    if (drive != nullptr && drive->uuid == chosen.identity->uuid) {
        return {chosen.directory};
    }
    const auto* const mount = mountWith(chosen.identity->uuid, surroundings);
    return mount == nullptr ? missing(chosen, surroundings) : Whereabouts{onMount(*mount, chosen)};
}

} // namespace quorl::finding
