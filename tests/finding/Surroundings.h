#pragma once

#include "services/finding/Drive.h"

namespace quorl::finding::test {

/// A stick that comes and goes, of this device number and UUID.
[[nodiscard]] inline Drive stick(const std::string& device, const std::string& uuid,
                                 const std::string& label = "") {
    return {.device = device,
            .node = "/dev/stick" + device,
            .uuid = uuid,
            .label = label,
            .isPluggable = true,
            .removal = Removal{"/block/" + uuid, "/drive/" + uuid, Removal::Way::Eject}};
}

[[nodiscard]] inline base::Mount mountOf(const std::string& device,
                                         const std::filesystem::path& directory,
                                         const std::string& type = "vfat") {
    return {.id = device,
            .device = device,
            .root = "/",
            .directory = directory,
            .isReadOnly = false,
            .type = type,
            .source = device.starts_with("0:") ? type : "/dev/stick" + device};
}

} // namespace quorl::finding::test
