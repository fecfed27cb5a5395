#include "services/wearable/Generations.h"

#include <cerrno>
#include <charconv>
#include <string_view>

#include <fcntl.h>
#include <xxhash.h>

#include "services/base/AtomicFile.h"
#include "services/base/FileStatus.h"
#include "services/language/Translated.h"
#include "services/wearable/Wearable.h"

namespace quorl::wearable {

using language::toTranslate;

namespace {

std::string checksum(std::string_view text) {
    constexpr int hexadecimal = 16;
    std::array<char, hexadecimal> digits{};
    const auto end = std::to_chars(digits.data(), digits.data() + digits.size(),
                                   XXH3_64bits(text.data(), text.size()), hexadecimal);
    return {digits.data(), end.ptr};
}

struct Generation {
    std::uint64_t number = 0;
    std::string_view text;
};

/// Nothing where the file is not as it was written.
std::optional<Generation> generationIn(const std::optional<std::string>& file) {
    const std::string_view contents = file ? *file : std::string_view();
    const auto space = contents.find(' ');
    const auto line = contents.find('\n');
    if (line == std::string_view::npos || space > line) {
        return std::nullopt;
    }
    Generation generation{0, contents.substr(line + 1)};
    std::from_chars(&contents[space] + 1, &contents[line], generation.number);
    const auto numbered = contents.substr(space + 1);
    const bool isWhole = generation.number > 0 &&
                         numbered.starts_with(std::to_string(generation.number) + "\n") &&
                         contents.substr(0, space) == checksum(numbered);
    return isWhole ? std::optional(generation) : std::nullopt;
}

std::optional<std::string> readOwnFile(int root, const char* name) {
    const auto path = std::string{ownDirectory} + "/" + name;
    base::FileStatus status{};
    if (fstatat(root, path.c_str(), &status, AT_SYMLINK_NOFOLLOW) != 0 && errno == ENOENT) {
        return std::nullopt;
    }
    // Reading tells what else is wrong.
    requireReadable(status.st_mode == 0 || S_ISREG(status.st_mode), base::stateOf(status).size);
    return base::readFile(root, path);
}

} // namespace

StoredManifest newestManifest(const ReadOwnFile& read) {
    std::array files{read(generationFiles[0]), read(generationFiles[1])};
    const std::array generations{generationIn(files[0]), generationIn(files[1])};
    if (!generations[0] && !generations[1]) {
        if (files[0] && files[1]) {
            rejectManifest(toTranslate("both copies of it are damaged"));
        }
        const auto former = read(formerManifestFile);
        return {former ? parseManifest(*former) : Manifest(), 0, files[1] ? 1U : 0U};
    }
    const bool isSecond =
        !generations[0] || (generations[1] && generations[1]->number > generations[0]->number);
    const auto& newest = *generations.at(isSecond ? 1 : 0);
    files.at(isSecond ? 0 : 1).reset(); // it may be long
    return {parseManifest(newest.text), newest.number, isSecond ? 0U : 1U};
}

std::string generationText(std::uint64_t number, const Manifest& manifest, std::size_t size) {
    auto text = toText(manifest).insert(0, std::to_string(number) + "\n");
    auto sum = checksum(text);
    while (sum.size() + 1 + text.size() < size) { // again where the new checksum is shorter
        text.append(size - sum.size() - 1 - text.size(), '\n');
        sum = checksum(text);
    }
    return text.insert(0, sum + " ");
}

void requireReadable(bool isRegularFile, std::uint64_t size) {
    constexpr std::uint64_t mostBytes = std::uint64_t{64} << 20;
    if (!isRegularFile) {
        rejectManifest(toTranslate("it is not a regular file"));
    }
    if (size > mostBytes) {
        rejectManifest(toTranslate("it is larger than 64 MiB"));
    }
}

Manifest loadManifest(int root) {
    const auto read = [root](const char* name) { return readOwnFile(root, name); };
    try {
        return newestManifest(read).manifest;
    } catch (const BadManifest&) {
        // One may have been written while the other was read.
        return newestManifest(read).manifest;
    }
}

} // namespace quorl::wearable
