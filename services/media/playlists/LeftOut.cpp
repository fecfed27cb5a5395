#include "services/media/playlists/LeftOut.h"

#include <algorithm>
#include <array>

#include "services/base/Utf8.h"
#include "services/language/Translated.h"

namespace quorl::media {

using language::filled;
using language::toTranslate;
using language::translated;

namespace {

struct Explanation {
    Reason reason;
    std::string_view code;
    const char* sentence;
};

constexpr std::array explanations{
    Explanation{Reason::NoAddress, "no-address",
                toTranslate("The playlist names no file for this track.")},
    Explanation{Reason::RemoteAddress, "remote-address",
                toTranslate("It is not on this machine. Download it into the music folder.")},
    Explanation{Reason::OtherSystem, "other-system",
                toTranslate("It is a path of another system. Save the playlist again with "
                            "paths relative to it.")},
    Explanation{Reason::OutsideFolder, "outside-folder",
                toTranslate("It is outside the music folder. Copy it into the music folder.")},
    Explanation{Reason::Missing, "missing",
                toTranslate("There is no such file. Put it back, or take it out of the playlist.")},
    Explanation{Reason::Unreachable, "unreachable",
                toTranslate("A directory on the way to it may not be entered. Check the "
                            "permissions.")},
    Explanation{Reason::Hidden, "hidden",
                toTranslate("It is hidden: a name on the way to it begins with a dot. Rename it.")},
    Explanation{Reason::NotRegularFile, "not-regular-file",
                toTranslate("It is not a regular file.")},
    Explanation{Reason::NotMusic, "not-music", toTranslate("It is neither audio nor video.")},
    Explanation{Reason::PlaylistUnreadable, "playlist-unreadable",
                toTranslate("The playlist cannot be read. Check its permissions and the disk.")},
    Explanation{Reason::PlaylistTooLarge, "playlist-too-large",
                toTranslate("The playlist is larger than 64 MiB. Split it.")},
    Explanation{
        Reason::PlaylistBroken, "playlist-broken",
        toTranslate(
            "The playlist is damaged, or not in an encoding that is known. Save it again with the "
            "program that made it, in UTF-8.")},
    Explanation{
        Reason::TooManyEntries, "too-many-entries",
        toTranslate("The playlist lists more than a million entries, and those after are ignored. "
                    "Split it.")},
    Explanation{
        Reason::SameAsAnother, "same-as-another",
        toTranslate(
            "Another playlist has the same name but for how its accents are stored. Rename one "
            "of the two.")},
    Explanation{Reason::DirectoryUnreadable, "directory-unreadable",
                toTranslate("The directory cannot be read. Check its permissions and the disk.")},
};

const Explanation& explanationOf(Reason reason) {
    return *std::ranges::find(explanations, reason, &Explanation::reason);
}

} // namespace

const char* sentence(Reason reason) { return explanationOf(reason).sentence; }

std::string_view code(Reason reason) { return explanationOf(reason).code; }

std::optional<Reason> reasonOf(std::string_view code) {
    const auto* const found = std::ranges::find(explanations, code, &Explanation::code);
    return found == explanations.end() ? std::nullopt : std::optional(found->reason);
}

std::string describe(const std::string& entry, const std::string& explanation) {
    return entry.empty() ? explanation
                         : filled(translated("{name}: {text}"),
                                  {{"name", base::printable(entry)}, {"text", explanation}});
}

std::string describe(const LeftOut& leftOut) {
    const auto place = leftOut.playlist.empty() ? translated("The music folder") : leftOut.playlist;
    return describe(place, describe(leftOut.entry, translated(sentence(leftOut.reason))));
}

} // namespace quorl::media
