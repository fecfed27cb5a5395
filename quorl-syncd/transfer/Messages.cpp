#include "quorl-syncd/transfer/Messages.h"

#include <cerrno>
#include <string>

#include "services/engine/Codes.h"

namespace quorl::syncd {

namespace code = engine::code;

using engine::Message;

Message messageOf(const std::error_code& error) {
    switch (error.value()) {
    case ENOSPC:
    case EDQUOT:
        return {code::wearableFull};
    case EROFS:
    case EACCES:
    case EPERM:
        return {code::writeProtected, {error.message()}};
    case ENOENT:
    case ENODEV:
    case EIO:
    case ESTALE:
        return {code::wentAway, {error.message()}};
    case ENOTDIR:
    case ELOOP:
        return {code::obstructed};
    default:
        return notSynced(error);
    }
}

Message notSynced(const std::error_code& error) { return {code::notSynced, {error.message()}}; }

Message notEnoughSpace(std::uint64_t needed, std::uint64_t available) {
    return {code::notEnoughSpace, {std::to_string(needed), std::to_string(available)}};
}

Message synced(std::size_t songs, std::size_t leftOut) {
    if (leftOut == 0) {
        return {code::synced, {std::to_string(songs)}};
    }
    return {code::syncedBut, {std::to_string(songs), std::to_string(leftOut)}};
}

Message notAllSent(const std::vector<Message>& problems) {
    Message message{code::songsLeftOut, engine::flat(problems.front())};
    message.arguments.insert(message.arguments.begin(), std::to_string(problems.size()));
    return message;
}

} // namespace quorl::syncd
