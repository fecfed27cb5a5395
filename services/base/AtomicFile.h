#pragma once

#include <cstddef>
#include <filesystem>
#include <limits>
#include <string>
#include <string_view>

#include "services/base/FileDescriptor.h"

/// Small files that are either the old ones or the new ones, whenever the power goes.
///
/// Directories are given as open descriptors, so that what is mounted or linked elsewhere in the
/// meantime makes no difference. Every failure throws `std::system_error`.
namespace quorl::base {

/// Opens the directory `name` in the directory `parent`, or makes it. Never follows a symbolic
/// link out of the wearable.
[[nodiscard]] FileDescriptor openDirectory(int parent, const char* name);

/// Makes the directory at `path` and those above it where they are not there, for their owner
/// alone.
void makeDirectories(const std::filesystem::path& path);

/// Opens the directory at the top of a wearable.
[[nodiscard]] FileDescriptor openRoot(const char* path);

/// Writes what the system still holds back for the open file or directory. A file system that
/// cannot do so for directories is no failure.
void syncToDevice(int descriptor);

/// Puts `text` in the place of the file `name`, and waits until it is on the device.
void replaceFile(int directory, const std::string& name, std::string_view text);

/// The contents of the file, or the first `most` bytes of them; empty where there is none.
[[nodiscard]] std::string readFile(int directory, const std::string& name,
                                   std::size_t most = std::numeric_limits<std::size_t>::max());

} // namespace quorl::base
