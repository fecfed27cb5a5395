#include "quorl-syncd/transfer/songs/SongProblem.h"

#include <utility>

#include "services/engine/Codes.h"

namespace quorl::syncd {

namespace {

using engine::Message;

Message messageOf(SongTrouble trouble, const std::string& song, const std::string& detail) {
    namespace code = engine::code;
    switch (trouble) {
    case SongTrouble::Gone:
        return {code::songGone, {song}};
    case SongTrouble::Unreadable:
        return {code::songUnreadable, {song, detail}};
    case SongTrouble::NotAFile:
        return {code::songNotAFile, {song}};
    case SongTrouble::Changed:
        return {code::songChanged, {song}};
    case SongTrouble::TooLarge:
        break;
    }
    return {code::songTooLarge, {song}};
}

} // namespace

SongProblem::SongProblem(Message message)
    : std::runtime_error(engine::sentence(message)), message_(std::move(message)) {}

SongProblem::SongProblem(SongTrouble trouble, const std::string& song, const std::string& detail)
    : SongProblem(messageOf(trouble, song, detail)) {}

} // namespace quorl::syncd
