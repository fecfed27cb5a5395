#pragma once

#include <filesystem>
#include <string>
#include <vector>

#include "tests/engine/transfer/Step.h"

namespace quorl::syncd::testing {

/// The options of strace with which it writes what `stepsIn` reads: one file for each thread.
[[nodiscard]] std::vector<std::string> tracer(const std::filesystem::path& log);

/// The lines that strace has written to such files, in the order of their calls.
[[nodiscard]] std::vector<std::string> linesOf(const std::filesystem::path& log);

/// What the calls have done to the directory of a wearable. Calls that failed have done nothing. A
/// step that no volume takes has the name of its call.
[[nodiscard]] Steps stepsIn(const std::vector<std::string>& lines,
                            const std::filesystem::path& wearable);

} // namespace quorl::syncd::testing
