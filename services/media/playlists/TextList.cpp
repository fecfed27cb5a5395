#include "services/media/playlists/TextList.h"

#include <limits>
#include <stdexcept>

namespace quorl::media {

std::uint32_t TextList::add(std::string_view text) {
    if (text.size() > std::numeric_limits<std::uint32_t>::max() - text_.size()) {
        throw std::length_error("A list of texts holds 4 GiB at most.");
    }
    text_.append(text);
    ends_.push_back(static_cast<std::uint32_t>(text_.size()));
    return size() - 1;
}

void TextList::shrink() {
    text_.shrink_to_fit();
    ends_.shrink_to_fit();
}

} // namespace quorl::media
