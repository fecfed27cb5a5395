#pragma once

#include <initializer_list>
#include <string>
#include <string_view>
#include <vector>

namespace quorl::tests {

/// What the code under test asked of its surroundings and told them, in order. The first word of a
/// line says what kind of line it is. Main thread only.
class Journal {
  public:
    void note(std::string line) { lines_.push_back(std::move(line)); }

    void clear() { lines_.clear(); }

    /// The lines whose first word is one of `kinds`.
    [[nodiscard]] std::vector<std::string>
    lines(std::initializer_list<std::string_view> kinds) const;

    /// How often `line` was noted.
    [[nodiscard]] std::size_t count(std::string_view line) const;

  private:
    std::vector<std::string> lines_;
};

} // namespace quorl::tests
