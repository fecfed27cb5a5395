#pragma once

namespace quorl::wearable {

/// How the embedded wearable is attached to this machine, which the user says in place of a plug.
struct Attachment {
    bool connected = true;
    bool onCharger = true;

    bool operator==(const Attachment&) const = default;
};

/// What was last saved on the wearable whose top directory is open as `root`; the default where
/// nothing was, or where it cannot be read.
[[nodiscard]] Attachment loadAttachment(int root);

/// Returns once it outlives a loss of power. Throws `std::system_error`.
void saveAttachment(int root, const Attachment& attachment);

} // namespace quorl::wearable
