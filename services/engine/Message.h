#pragma once

#include <string>
#include <vector>

namespace quorl::engine {

/// Something to tell a person: for programs that go by it, and for wording in any language.
struct Message {
    /// One of Codes.h; empty for nothing to tell. Another engine may have others.
    std::string code = {};
    /// As its code says. Counts are decimal numbers, paths any bytes; what the system says is in
    /// its own words.
    std::vector<std::string> arguments = {};

    bool operator==(const Message&) const = default;
};

/// In English, in a sentence or several; empty for a code that is not known. Arguments that are
/// missing leave a gap, and too many are ignored. Control characters in paths are replaced.
[[nodiscard]] std::string sentence(const Message& message);

/// A message of which nothing but its sentence is known.
[[nodiscard]] Message other(std::string sentence);

/// As one list, to be an argument of another message: its code, then its arguments.
[[nodiscard]] std::vector<std::string> flat(const Message& message);

} // namespace quorl::engine
