#pragma once

#include <string>

#include "platform/Foundation.h"

namespace quorl {

/// What a person wants who types a line.
struct TypedCommand {
    enum class Kind {
        Choose,
        GoBack,
        Search,
        EndSearch,
        NextPage,
        PreviousPage,
        ShowAgain,
        Explain,
        Leave,
        Unknown
    };

    Kind kind;
    NSInteger number = 0;   ///< of the row to choose, as it was typed: there may be no such row
    std::string words = {}; ///< to search for
};

/// Takes a line without white space at its ends.
[[nodiscard]] TypedCommand commandIn(const std::string& line);

/// What can be typed, in one line of as many columns.
[[nodiscard]] std::string howToGoOn(int columns);

/// What each command does, in lines.
[[nodiscard]] std::string explanation();

} // namespace quorl
