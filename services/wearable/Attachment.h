#pragma once

#include <optional>

namespace quorl::wearable {

/// How the embedded wearable is attached to this machine, which the user says in place of a plug.
struct Attachment {
    bool connected = true;
    bool onCharger = true;

    bool operator==(const Attachment&) const = default;
};

/// What of an attachment is to become another one; nothing for what stays.
struct AttachmentChange {
    std::optional<bool> connected;
    std::optional<bool> onCharger;

    [[nodiscard]] Attachment appliedTo(const Attachment& attachment) const {
        return {connected.value_or(attachment.connected), onCharger.value_or(attachment.onCharger)};
    }
};

/// What was last saved on the wearable whose top directory is open as `root`; the default where
/// nothing was, or where it cannot be read.
[[nodiscard]] Attachment loadAttachment(int root);

/// Returns once it outlives a loss of power. Throws `std::system_error`.
void saveAttachment(int root, const Attachment& attachment);

} // namespace quorl::wearable
