#include "quorl-syncd/transfer/Sentences.h"

#include <cerrno>

#include "services/wearable/Wearable.h"

namespace quorl::syncd {

namespace {

std::string velora() { return std::string("The ") + wearable::wearableName; }

std::string countOfSongs(std::size_t count) {
    return count == 1 ? "1 song" : std::to_string(count) + " songs";
}

std::string megabytes(std::uint64_t bytes) {
    constexpr std::uint64_t megabyte = 1 << 20;
    return std::to_string(bytes / megabyte + (bytes % megabyte == 0 ? 0 : 1)) + " MB";
}

} // namespace

DeviceTrouble troubleOf(const std::error_code& error) {
    switch (error.value()) {
    case ENOSPC:
    case EDQUOT:
        return DeviceTrouble::Full;
    case EROFS:
    case EACCES:
    case EPERM:
        return DeviceTrouble::WriteProtected;
    case ENOENT:
    case ENODEV:
    case EIO:
    case ESTALE:
        return DeviceTrouble::Away;
    case ENOTDIR:
    case ELOOP:
        return DeviceTrouble::Obstructed;
    default:
        return DeviceTrouble::Other;
    }
}

std::string sentence(DeviceTrouble trouble, const std::error_code& error) {
    switch (trouble) {
    case DeviceTrouble::Full:
        return velora() + " is full. Remove something from it, or choose a lower limit.";
    case DeviceTrouble::WriteProtected:
        return velora() + " cannot be written to: " + error.message() +
               ". Check that it is not write-protected.";
    case DeviceTrouble::Away:
        return velora() + " went away: " + error.message() + ". Connect it again.";
    case DeviceTrouble::Obstructed:
        return std::string("On the ") + wearable::wearableName + ", “" + wearable::musicDirectory +
               "” or “" + wearable::ownDirectory +
               "” is not a directory. Give it another name, or remove it.";
    case DeviceTrouble::Other:
        break;
    }
    return velora() + " could not be synced: " + error.message() + ".";
}

std::string anotherProgramIsSyncing() {
    return std::string("Another program is syncing to this ") + wearable::wearableName +
           ". Wait until it is done, or end it.";
}

std::string notEnoughMemory() {
    return velora() + " could not be synced, for there is not enough memory. Close some programs.";
}

std::string notEnoughSpace(std::uint64_t needed, std::uint64_t available) {
    return velora() + " has not enough space: " + megabytes(needed) +
           " are needed for new songs, " + megabytes(available) +
           " are available. Remove something from it, or choose a lower limit.";
}

std::string synced(std::size_t songs) {
    return countOfSongs(songs) + " synced to " + wearable::wearableName + ".";
}

std::string notAllSent(const std::vector<std::string>& problems) {
    const auto others = problems.size() - 1;
    return problems.front() +
           (others == 0 ? "" : " " + countOfSongs(others) + " more could not be sent.");
}

} // namespace quorl::syncd
