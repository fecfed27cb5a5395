#include "quorl-simulate/Troubles.h"

#include <algorithm>
#include <utility>

namespace quorl::simulation {

namespace {

using namespace std::chrono_literals;

constexpr auto longestNews = 1s;

constexpr std::array<std::string_view, 2> successes{" synced to ", " removed from "};

/// What the engine says of each, in part.
constexpr std::array<std::pair<std::string_view, Trouble>, 20> sentences{{
    {" is full. ", Trouble::Full},
    {" has not enough space: ", Trouble::Full},
    {" write-protected.", Trouble::WriteProtected},
    {" went away: ", Trouble::Away},
    {" cannot be reached: ", Trouble::Away},
    {" cannot be used ", Trouble::BadManifest},
    {"” is no longer in the music folder.", Trouble::SongGone},
    {"” has just been changed.", Trouble::SongChanged},
    {"” cannot be read: ", Trouble::SongUnreadable},
    {"” is larger than a file ", Trouble::SongTooLarge},
    {"The preferences cannot be written.", Trouble::BadPreferences},
    {"Music sync is switched off.", Trouble::OtherChoice},
    {"No playlist is chosen.", Trouble::OtherChoice},
    {"Something else was chosen.", Trouble::OtherChoice},
    {"The chosen playlist is not in the music folder.", Trouble::OtherChoice},
    {"The chosen playlist is not in the music folder.", Trouble::ListGone},
    {"The wearable is not connected.", Trouble::OtherAttachment},
    {"The wearable is not on its charger.", Trouble::OtherAttachment},
    {"The sync was cancelled.", Trouble::Cancelled},
    {"The sync engine was ended.", Trouble::Ended},
}};

} // namespace

bool Troubles::explain(std::string_view sentence) const {
    const auto isTold = [sentence](std::string_view part) {
        return sentence.find(part) != std::string_view::npos;
    };
    return std::ranges::any_of(successes, isTold) ||
           std::ranges::any_of(sentences, [&](const auto& each) {
               const auto last = last_.at(static_cast<std::size_t>(each.second));
               return isTold(each.first) && last && *last + longestNews >= session_;
           });
}

} // namespace quorl::simulation
