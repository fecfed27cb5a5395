#include "services/engine/Message.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstdint>
#include <limits>
#include <optional>
#include <string_view>
#include <utility>

#include "services/base/Utf8.h"
#include "services/engine/Codes.h"
#include "services/language/Numbers.h"
#include "services/language/Translated.h"
#include "services/media/playlists/LeftOut.h"
#include "services/wearable/Unseen.h"
#include "services/wearable/Wearable.h"

namespace quorl::engine {

using language::filled;
using language::toTranslate;
using language::translated;
using language::translatedCount;

namespace {

using Arguments = std::vector<std::string>;

/// More than any message has. Whoever sends more wants to have messages within messages worded.
constexpr std::size_t mostArguments = 8;

struct Wording {
    std::string_view code;
    /// With blanks in braces: the name of one of `blanks`, and the number of an argument.
    const char* pattern;
};

constexpr std::array wordings{
    Wording{code::syncOff, toTranslate("Music sync is switched off.")},
    Wording{code::noPlaylist, toTranslate("No playlist is chosen.")},
    Wording{code::readingMusic, toTranslate("Reading the music folder…")},
    Wording{code::playlistGone, toTranslate("The chosen playlist is not in the music folder.")},
    Wording{code::lookingForWearable, toTranslate("Looking for the wearable…")},
    Wording{code::notConnected, toTranslate("The wearable is not connected.")},
    Wording{code::notOnCharger, toTranslate("The wearable is not on its charger.")},
    Wording{code::syncing, toTranslate("Syncing music.")},
    Wording{code::stopping, toTranslate("Ending the sync. {message 0}")},
    Wording{code::aboutToSync, toTranslate("About to sync music.")},
    Wording{code::removing, toTranslate("Removing the music.")},
    Wording{code::upToDate, toTranslate("Everything is up to date.")},
    Wording{code::upToDateBut,
            toTranslate("Everything that could be found is on the {wearable}. {songs 0} could "
                        "not be found or read.")},
    Wording{code::synced, toTranslate("{songs 0} synced to {wearable}.")},
    Wording{code::syncedBut,
            toTranslate("{songs 0} synced to {wearable}. {songs 1} could not be found or read.")},
    Wording{code::removed, toTranslate("The music was removed from the {wearable}.")},
    Wording{code::songsLeftOut, toTranslate("{message 1}{others 0}")},
    Wording{code::cancelled, toTranslate("The sync was cancelled.")},
    Wording{code::ended, toTranslate("The sync engine was ended.")},
    Wording{code::stopped, toTranslate("The sync was stopped.")},
    Wording{code::somethingElseChosen, toTranslate("Something else was chosen.")},
    Wording{code::anotherProgram,
            toTranslate("Another program is syncing to this {wearable}. Wait until it is "
                        "done, or end it.")},
    Wording{code::notEnoughMemory,
            toTranslate("The {wearable} could not be synced, for there is not enough "
                        "memory. Close some programs.")},
    Wording{code::notEnoughSpace,
            toTranslate(
                "The {wearable} has not enough space: {megabytes 0} are needed for new songs, "
                "{megabytes 1} are available. Remove something from it, or choose a lower limit.")},
    Wording{
        code::wearableFull,
        toTranslate("The {wearable} is full. Remove something from it, or choose a lower limit.")},
    Wording{code::writeProtected,
            toTranslate("The {wearable} cannot be written to{detail 0}. Check that it is "
                        "not write-protected.")},
    Wording{code::wentAway, toTranslate("The {wearable} went away{detail 0}. Connect it again.")},
    Wording{code::obstructed,
            toTranslate("On the {wearable}, “{music}” or “{own}” is not a directory. Give it "
                        "another name, or remove it.")},
    Wording{code::notSynced, toTranslate("The {wearable} could not be synced{detail 0}.")},
    Wording{code::songGone, toTranslate("{song 0} is no longer in the music folder.")},
    Wording{code::songUnreadable, toTranslate("{song 0} cannot be read{detail 1}.")},
    Wording{code::songNotAFile, toTranslate("{song 0} is not a file any more.")},
    Wording{code::songChanged,
            toTranslate("{song 0} has just been changed. It will be sent once it stays as it is.")},
    Wording{code::songTooLarge,
            toTranslate("{song 0} is larger than a file on the {wearable} can be.")},
    Wording{wearable::unseen::unreachable,
            toTranslate("The {wearable} at {path 0} cannot be reached: {text 1}.")},
    Wording{wearable::unseen::silent,
            toTranslate("The {wearable} does not answer. Check its connection.")},
    Wording{wearable::unseen::noThreads,
            toTranslate("The {wearable} cannot be looked at, for no more threads can be started. "
                        "Close some programs.")},
    Wording{
        wearable::unseen::badManifest,
        toTranslate(
            "The list of the music on the {wearable} cannot be used ({text 0}). Remove the files "
            "{own}/manifest.* from it to begin anew; the music that is on it then stays.")},
    Wording{wearable::unseen::notPluggedIn,
            toTranslate("The {wearable} that was chosen is not plugged in. Plug it in.")},
    Wording{wearable::unseen::otherDrive,
            toTranslate("The {wearable} that was chosen is not connected. {drive 1} is at {path 0} "
                        "in its place. Plug in the one that was chosen, or choose this one.")},
    Wording{code::other, "{text 0}"},
    Wording{code::titleSynced, toTranslate("Music synced")},
    Wording{code::titleNotSynced, toTranslate("Music not synced")},
};

std::string at(const Arguments& arguments, std::size_t place) {
    return place < arguments.size() ? arguments[place] : std::string();
}

/// Nothing where it is no number; who sends such a thing is shown what was sent.
std::optional<std::uint64_t> numberIn(const std::string& text) {
    std::uint64_t number = 0;
    const auto* const end = text.data() + text.size();
    const auto read = std::from_chars(text.data(), end, number);
    return read.ec == std::errc() && read.ptr == end ? std::optional(number) : std::nullopt;
}

std::string countOfSongs(std::uint64_t count) {
    return translatedCount("{count} song", "{count} songs", count);
}

std::string songs(const Arguments& arguments, std::size_t place) {
    const auto count = numberIn(at(arguments, place));
    return count ? countOfSongs(*count) : at(arguments, place);
}

/// Of several songs those that are not named, with what parts the sentence from the one before.
std::string others(const Arguments& arguments, std::size_t place) {
    const auto count = numberIn(at(arguments, place)).value_or(0);
    return count < 2 ? ""
                     : translatedCount(" {count} more song could not be sent.",
                                       " {count} more songs could not be sent.", count - 1);
}

/// Rounded up.
std::string megabytes(const Arguments& arguments, std::size_t place) {
    constexpr std::uint64_t megabyte = 1 << 20;
    const auto bytes = numberIn(at(arguments, place));
    return bytes ? language::megabyteText(*bytes / megabyte + (*bytes % megabyte == 0 ? 0 : 1))
                 : at(arguments, place);
}

std::string song(const Arguments& arguments, std::size_t place) {
    const auto path = at(arguments, place);
    return path.empty() ? translated("It")
                        : filled(translated("“{name}”"), {{"name", base::printable(path)}});
}

/// A sentence from elsewhere, which may be one that is known here.
std::string text(const Arguments& arguments, std::size_t place) {
    return translated(at(arguments, place).c_str());
}

std::string path(const Arguments& arguments, std::size_t place) {
    return base::printable(at(arguments, place));
}

std::string drive(const Arguments& arguments, std::size_t place) {
    const auto name = path(arguments, place);
    return name.empty() ? translated("Another drive")
                        : filled(translated("Another drive, “{name}”,"), {{"name", name}});
}

/// With what parts it from the sentence that it is in.
std::string detail(const Arguments& arguments, std::size_t place) {
    const auto text = at(arguments, place);
    return text.empty() ? "" : filled(translated(": {text}"), {{"text", text}});
}

/// All arguments from here on are its own.
std::string message(const Arguments& arguments, std::size_t place) {
    if (place >= arguments.size()) {
        return {};
    }
    const auto begin = arguments.begin() + static_cast<std::ptrdiff_t>(place);
    return sentence({*begin, Arguments(begin + 1, arguments.end())});
}

std::string wearableIn(const Arguments& /*arguments*/, std::size_t /*place*/) {
    return wearable::wearableName;
}

std::string musicDirectoryIn(const Arguments& /*arguments*/, std::size_t /*place*/) {
    return wearable::musicDirectory;
}

std::string ownDirectoryIn(const Arguments& /*arguments*/, std::size_t /*place*/) {
    return wearable::ownDirectory;
}

struct Blank {
    std::string_view name;
    std::string (*fill)(const Arguments& arguments, std::size_t place);
};

constexpr std::array blanks{
    Blank{"wearable", wearableIn}, Blank{"music", musicDirectoryIn},
    Blank{"own", ownDirectoryIn},  Blank{"songs", songs},
    Blank{"others", others},       Blank{"megabytes", megabytes},
    Blank{"song", song},           Blank{"detail", detail},
    Blank{"message", message},     Blank{"text", text},
    Blank{"path", path},           Blank{"drive", drive},
};

/// A catalogue is somebody else's file: what it has in braces may be anything.
std::string fill(std::string_view blank, const Arguments& arguments) {
    const auto space = std::min(blank.find(' '), blank.size());
    const auto written = numberIn(std::string(blank.substr(std::min(space + 1, blank.size()))));
    constexpr std::uint64_t last = std::numeric_limits<std::size_t>::max();
    const auto place = static_cast<std::size_t>(std::min(written.value_or(0), last));
    const auto* const found = std::ranges::find(blanks, blank.substr(0, space), &Blank::name);
    return found == blanks.end() ? '{' + std::string(blank) + '}' : found->fill(arguments, place);
}

std::string worded(const char* pattern, const Arguments& arguments) {
    return filled(translated(pattern),
                  [&arguments](std::string_view blank) { return fill(blank, arguments); });
}

} // namespace

std::string sentence(const Message& message) {
    if (message.arguments.size() > mostArguments) {
        return {};
    }
    const auto* const wording = std::ranges::find(wordings, message.code, &Wording::code);
    if (wording != wordings.end()) {
        return worded(wording->pattern, message.arguments);
    }
    const auto reason = media::reasonOf(message.code);
    return reason ? translated(media::sentence(*reason)) : std::string();
}

Message other(std::string sentence) { return {code::other, {std::move(sentence)}}; }

std::vector<std::string> flat(const Message& message) {
    std::vector<std::string> list{message.code};
    list.insert(list.end(), message.arguments.begin(), message.arguments.end());
    return list;
}

} // namespace quorl::engine
