#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "services/base/Reader.h"
#include "services/wearable/Manifest.h"

/// The manifest on a wearable. It is kept twice, in two files of our own directory, each with a
/// number and a checksum. Only the older one is ever written, so that whatever becomes of that,
/// there is one that is whole; the valid one with the higher number counts.
namespace quorl::wearable {

inline constexpr std::array<const char*, 2> generationFiles{"manifest.1", "manifest.2"};

/// Held the manifest before there were generations. Counts where neither of them is there.
inline constexpr const char* formerManifestFile = "manifest.json";

/// The newest manifest of a wearable.
struct StoredManifest {
    Manifest manifest;
    /// Of its generation; 0 where there is none.
    std::uint64_t number = 0;
    /// Which of `generationFiles` is to hold the next generation.
    std::size_t next = 0;
};

/// Opens a file of our own directory; null where there is none.
using OpenOwnFile = std::function<std::unique_ptr<base::Reader>(const char* name)>;

/// Gives back the contents of a file of our own directory, nothing where there is none.
using ReadOwnFile = std::function<std::optional<std::string>(const char* name)>;

/// Empty where nothing was ever saved, or the very first saving was cut short. Throws `BadManifest`
/// where what there is cannot be used, and what opening and reading throw.
[[nodiscard]] StoredManifest newestManifest(const OpenOwnFile& open);
[[nodiscard]] StoredManifest newestManifest(const ReadOwnFile& read);

/// Writes the contents of the file for the generation of this number, from 1 on, in pieces of
/// 64 KiB.
/// @param size of the file that they are to be written over, in bytes; they fill it at least.
void writeGeneration(std::uint64_t number, const Manifest& manifest, std::uint64_t size,
                     const TextSink& write);

/// The same in one piece.
[[nodiscard]] std::string generationText(std::uint64_t number, const Manifest& manifest,
                                         std::uint64_t size = 0);

/// The device may have been in other hands: what could be waited for without end, or would fill the
/// memory, must not be read. Throws `BadManifest` for such a file.
/// @param size in bytes.
void requireReadable(bool isRegularFile, std::uint64_t size);

/// The manifest of the wearable whose top directory is open as `root`, also while a sync writes it.
/// Throws `BadManifest` or `std::system_error`.
[[nodiscard]] Manifest loadManifest(int root);

} // namespace quorl::wearable
