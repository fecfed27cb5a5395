#pragma once

#include <string>

#include "services/preferences/Pointers.h"

namespace quorl::preferences {

struct [[nodiscard]] FoundSchema {
    /// Null when there is none that fits.
    SchemaPointer schema;

    /// Why it is null: a sentence that names the directories that were searched and says what to
    /// do.
    std::string problem;
};

/// Looks for the compiled schema beside the running program (`../share/glib-2.0/schemas`), which is
/// right in a build tree and in any installation, then where GSettings looks, and checks that it
/// has each value of the table with its type: GSettings would end the process on a value that is
/// missing.
FoundSchema findSchema();

} // namespace quorl::preferences
