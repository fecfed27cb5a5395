#include "services/media/ContentKinds.h"

#include <algorithm>
#include <array>
#include <memory>

#include <fcntl.h>
#include <gio/gio.h>
#include <sys/stat.h>
#include <unistd.h>

#include "services/base/FileDescriptor.h"
#include "services/base/FileStatus.h"

namespace quorl::media {

namespace {

/// Content types that call themselves audio or video but are lists of songs.
constexpr std::array<std::string_view, 7> listTypes{
    "audio/x-mpegurl",    "audio/x-scpls",  "audio/x-ms-asx",
    "audio/x-iriver-pla", "audio/x-amzxml", "audio/x-pn-realaudio-plugin",
    "video/vnd.mpegurl",
};

/// What follows the last dot of a longer one is part of a title, and not worth remembering.
constexpr std::size_t longestExtension = 12;

struct Guess {
    std::optional<Kind> kind;
    bool uncertain;
};

std::optional<Kind> kindOfType(std::string_view type) {
    if (std::ranges::find(listTypes, type) != listTypes.end()) {
        return std::nullopt;
    }
    if (type.starts_with("audio/")) {
        return Kind::Audio;
    }
    if (type.starts_with("video/")) {
        return Kind::MusicVideo;
    }
    return std::nullopt;
}

Guess guess(const char* name, const unsigned char* bytes, std::size_t size) {
    gboolean uncertain = FALSE;
    char* const type = g_content_type_guess(name, bytes, size, &uncertain);
    const Guess result{kindOfType(type), uncertain != FALSE};
    g_free(type);
    return result;
}

std::optional<Kind> kindByFirstBytes(int directory, const char* name) {
    // Not blocking, for what was a file a moment ago may be a pipe by now.
    const base::FileDescriptor file(
        openat(directory, name, O_RDONLY | O_NONBLOCK | O_NOCTTY | O_CLOEXEC));
    base::FileStatus status{};
    if (!file || fstat(file.get(), &status) != 0 || !S_ISREG(status.st_mode)) {
        return std::nullopt;
    }
    std::array<unsigned char, 4096> bytes{};
    const ssize_t size = read(file.get(), bytes.data(), bytes.size());
    return size > 0 ? guess(nullptr, bytes.data(), static_cast<std::size_t>(size)).kind
                    : std::nullopt;
}

} // namespace

std::optional<Kind> ContentKinds::kindOf(int directory, const char* name) {
    switch (toldByName(name)) {
    case Told::Audio:
        return Kind::Audio;
    case Told::MusicVideo:
        return Kind::MusicVideo;
    case Told::Other:
        return std::nullopt;
    case Told::Nothing:
        break;
    }
    return kindByFirstBytes(directory, name);
}

bool ContentKinds::mayBeSong(std::string_view name) { return toldByName(name) != Told::Other; }

ContentKinds::Told ContentKinds::toldByName(std::string_view name) {
    const std::size_t dot = name.rfind('.');
    const std::string_view extension = dot == std::string_view::npos ? "" : name.substr(dot);
    if (const auto known = byExtension_.find(extension); known != byExtension_.end()) {
        return known->second;
    }
    // A name of one letter and the extension, so that no whole name such as "core" decides for
    // others.
    const Guess guessed = guess(("x" + std::string(extension)).c_str(), nullptr, 0);
    Told told = guessed.uncertain ? Told::Nothing : Told::Other;
    if (guessed.kind) {
        told = *guessed.kind == Kind::Audio ? Told::Audio : Told::MusicVideo;
    }
    if (extension.size() <= longestExtension) {
        byExtension_.emplace(extension, told);
    }
    return told;
}

} // namespace quorl::media
