#include "tests/base/ManualPage.h"

#include <fstream>
#include <iterator>
#include <stdexcept>
#include <string_view>

namespace quorl::tests {

std::string exampleIn(const std::string& page) {
    constexpr std::string_view begin = "\n.EX\n";
    std::ifstream file(MANUAL_PAGES "/" + page);
    const std::string text(std::istreambuf_iterator<char>(file), {});
    const auto found = text.find(begin);
    if (found == std::string::npos) {
        throw std::runtime_error(page + " has no example");
    }
    const auto first = found + begin.size();
    return text.substr(first, text.find(".EE\n", first) - first);
}

} // namespace quorl::tests
