#pragma once

#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <utility>

#include "runtime/plugins/BundleFiles.h"

namespace quorl::tests {

[[nodiscard]] inline std::string bytesOf(const std::filesystem::path& file) {
    std::ostringstream bytes;
    bytes << std::ifstream(file, std::ios::binary).rdbuf();
    return std::move(bytes).str();
}

/// The digests of the string tables in the directory of a bundle as they are now.
[[nodiscard]] inline Digests digestsOfTexts(const std::filesystem::path& bundle) {
    Digests digests;
    for (const auto& entry : std::filesystem::recursive_directory_iterator(bundle / "locale")) {
        if (entry.is_regular_file()) {
            digests[entry.path().lexically_relative(bundle).string()] =
                sha256(bytesOf(entry.path()));
        }
    }
    return digests;
}

} // namespace quorl::tests
