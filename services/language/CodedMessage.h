#pragma once

#include <string>
#include <vector>

namespace quorl::language {

/// Something to tell a person: for programs that go by it, and for wording in any language.
struct CodedMessage {
    /// A word in small letters and dashes; empty for nothing to tell.
    std::string code = {};
    /// As its code says. Counts are decimal numbers, paths any bytes; what the system says is in
    /// its own words.
    std::vector<std::string> arguments = {};

    bool operator==(const CodedMessage&) const = default;
};

} // namespace quorl::language
