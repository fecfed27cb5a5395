#include "services/wearable/Generations.h"

#include <cerrno>
#include <span>
#include <string_view>
#include <utility>

#include <fcntl.h>

#include "services/base/AtomicFile.h"
#include "services/base/FileStatus.h"
#include "services/language/Translated.h"
#include "services/wearable/Checksum.h"
#include "services/wearable/GenerationReader.h"
#include "services/wearable/Wearable.h"

namespace quorl::wearable {

using language::toTranslate;

namespace {

/// A text in memory.
class TextReader final : public base::Reader {
  public:
    explicit TextReader(std::string text) : text_(std::move(text)) {}

    [[nodiscard]] std::size_t read(std::span<std::byte> buffer) override {
        const auto size = text_.copy(reinterpret_cast<char*>(buffer.data()), buffer.size(), at_);
        at_ += size;
        return size;
    }

  private:
    const std::string text_;
    std::size_t at_ = 0;
};

/// Gives on a text in pieces of one size.
class EvenPieces {
  public:
    explicit EvenPieces(const TextSink& sink) : sink_(sink) { piece_.reserve(size); }

    void add(std::string_view text) {
        while (piece_.size() + text.size() >= size) {
            const auto rest = size - piece_.size();
            sink_(piece_.append(text.substr(0, rest)));
            piece_.clear();
            text.remove_prefix(rest);
        }
        piece_ += text;
    }

    void finish() {
        if (!piece_.empty()) {
            sink_(piece_);
        }
    }

  private:
    static constexpr std::size_t size = 65536;

    const TextSink& sink_;
    std::string piece_;
};

void writeLineFeeds(std::uint64_t count, const TextSink& sink) {
    const std::string lineFeeds(4096, '\n');
    for (; count > lineFeeds.size(); count -= lineFeeds.size()) {
        sink(lineFeeds);
    }
    sink(std::string_view(lineFeeds).substr(0, static_cast<std::size_t>(count)));
}

/// What stands in the file behind its checksum and a space, without having been written yet.
struct Numbered {
    std::string checksum;
    std::uint64_t lineFeeds = 0;
};

Numbered measured(const std::string& line, const Manifest& manifest, std::uint64_t size) {
    Checksum checksum;
    std::uint64_t length = 0;
    const TextSink measure = [&](std::string_view text) {
        checksum.add(text);
        length += text.size();
    };
    measure(line);
    writeText(manifest, measure);
    Numbered numbered{checksum.text()};
    const auto missing = [&] {
        const auto used = numbered.checksum.size() + 1 + length;
        return used < size ? size - used : 0;
    };
    while (const auto count = missing()) { // again where the new checksum is shorter
        writeLineFeeds(count, measure);
        numbered.lineFeeds += count;
        numbered.checksum = checksum.text();
    }
    return numbered;
}

using OpenGenerations = std::array<std::optional<GenerationReader>, generationFiles.size()>;

void openAll(OpenGenerations& files, const OpenOwnFile& open) {
    for (std::size_t index = 0; index < files.size(); ++index) {
        if (auto file = open(generationFiles.at(index))) {
            files.at(index).emplace(std::move(file));
        }
    }
}

/// Which of them counts where it is whole.
std::size_t likelyNewest(const OpenGenerations& files) {
    return files[1] && (!files[0] || files[1]->number() > files[0]->number()) ? 1 : 0;
}

Manifest formerManifest(const OpenOwnFile& open) {
    auto file = open(formerManifestFile);
    if (!file) {
        return {};
    }
    TextInPieces text(std::move(file));
    return parseManifest(text);
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

StoredManifest newestManifest(const OpenOwnFile& open) {
    OpenGenerations files;
    openAll(files, open);
    const auto likely = likelyNewest(files);
    for (const auto index : {likely, 1 - likely}) {
        auto& file = files.at(index);
        if (auto manifest = file ? file->read() : std::nullopt) {
            return {std::move(*manifest), file->number(), 1 - index};
        }
    }
    if (files[0] && files[1]) {
        rejectManifest(toTranslate("both copies of it are damaged"));
    }
    return {formerManifest(open), 0, files[1] ? 1U : 0U};
}

StoredManifest newestManifest(const ReadOwnFile& read) {
    const OpenOwnFile open = [&](const char* name) -> std::unique_ptr<base::Reader> {
        auto text = read(name);
        return text ? std::make_unique<TextReader>(std::move(*text)) : nullptr;
    };
    return newestManifest(open);
}

void writeGeneration(std::uint64_t number, const Manifest& manifest, std::uint64_t size,
                     const TextSink& write) {
    const auto line = std::to_string(number) + "\n";
    const auto [checksum, lineFeeds] = measured(line, manifest, size);
    EvenPieces pieces(write);
    const TextSink add = [&](std::string_view text) { pieces.add(text); };
    add(checksum + " " + line);
    writeText(manifest, add);
    writeLineFeeds(lineFeeds, add);
    pieces.finish();
}

std::string generationText(std::uint64_t number, const Manifest& manifest, std::uint64_t size) {
    std::string text;
    writeGeneration(number, manifest, size, [&](std::string_view piece) { text += piece; });
    return text;
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

/// The text is read at once, so that a sync has little time to write over it meanwhile.
Manifest loadManifest(int root) {
    const ReadOwnFile read = [root](const char* name) { return readOwnFile(root, name); };
    try {
        return newestManifest(read).manifest;
    } catch (const BadManifest&) {
        // One may have been written while the other was read.
        return newestManifest(read).manifest;
    }
}

} // namespace quorl::wearable
