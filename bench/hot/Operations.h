#pragma once

#include <algorithm>
#include <charconv>
#include <iostream>
#include <span>
#include <string_view>

namespace quorl {

/// Something that is done a number of times, for whoever counts what it takes.
template <class Stage>
struct Operation {
    std::string_view name;
    void (Stage::*perform)() const;
    std::string_view beside = {}; ///< the operation to hold it against; empty for none
};

/// Names the operations, or does what the command line says on the stage that `prepare` gives. The
/// result is the program's.
template <class Stage, class Prepare>
int perform(std::span<const Operation<Stage>> operations, std::span<char*> arguments,
            Prepare prepare) {
    if (arguments.size() != 3) {
        for (const auto& operation : operations) {
            std::cout << operation.name << (operation.beside.empty() ? "" : "\t")
                      << operation.beside << '\n';
        }
        return 0;
    }
    const auto found =
        std::ranges::find(operations, std::string_view(arguments[1]), &Operation<Stage>::name);
    const std::string_view digits = arguments[2];
    int turns = 0;
    const auto read = std::from_chars(digits.data(), digits.data() + digits.size(), turns);
    if (found == operations.end() || read.ptr != digits.data() + digits.size()) {
        std::cerr << "give the name of an operation and a number\n";
        return 2;
    }
    const auto stage = prepare();
    for (int turn = 0; turn < turns; ++turn) {
        ((*stage).*found->perform)();
    }
    return 0;
}

} // namespace quorl
