#pragma once

#include <string>
#include <vector>

namespace quorl::syncd::testing {

/// What a volume is about to do.
struct Step {
    /// As "rename", "fsync" or "write".
    std::string operation;
    /// With its directory, as "Music/one.mp3"; empty for the whole volume.
    std::string file;
    /// Of a rename, the new name; of a write, what is written.
    std::string detail;
};

using Steps = std::vector<Step>;

} // namespace quorl::syncd::testing
