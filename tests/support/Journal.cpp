#include "tests/support/Journal.h"

#include <algorithm>

namespace quorl::tests {

std::vector<std::string> Journal::lines(std::initializer_list<std::string_view> kinds) const {
    std::vector<std::string> wanted;
    std::copy_if(lines_.begin(), lines_.end(), std::back_inserter(wanted),
                 [kinds](const std::string& line) {
                     const auto kind = std::string_view(line).substr(0, line.find(' '));
                     return std::find(kinds.begin(), kinds.end(), kind) != kinds.end();
                 });
    return wanted;
}

std::size_t Journal::count(std::string_view line) const {
    return static_cast<std::size_t>(std::count(lines_.begin(), lines_.end(), line));
}

} // namespace quorl::tests
