#include "quorl-syncd/transfer/songs/SongProblem.h"

#include "services/base/Utf8.h"
#include "services/wearable/Wearable.h"

namespace quorl::syncd {

namespace {

std::string ending(SongTrouble trouble, const std::string& detail) {
    switch (trouble) {
    case SongTrouble::Gone:
        return " is no longer in the music folder.";
    case SongTrouble::Unreadable:
        return " cannot be read: " + detail + ".";
    case SongTrouble::NotAFile:
        return " is not a file any more.";
    case SongTrouble::Changed:
        return " has just been changed. It will be sent once it stays as it is.";
    case SongTrouble::TooLarge:
        break;
    }
    return std::string(" is larger than a file on the ") + wearable::wearableName + " can be.";
}

} // namespace

SongProblem::SongProblem(SongTrouble trouble, const std::string& song, const std::string& detail)
    : std::runtime_error("“" + base::printable(song) + "”" + ending(trouble, detail)) {}

} // namespace quorl::syncd
