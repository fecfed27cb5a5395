#pragma once

#include <string>
#include <vector>

#include "services/base/Purpose.h"
#include "services/preferences/Pointers.h"

namespace quorl::preferences {

struct [[nodiscard]] FoundSchemas {
    /// In the order of `schemaNames`; empty when one is missing, or does not fit.
    std::vector<SchemaPointer> schemas;

    /// Why: a sentence that names the directories that were searched and says what to do.
    std::string problem;
};

/// Looks for the compiled schemas beside the running program (`../share/glib-2.0/schemas`), which
/// is right in a build tree and in any installation, then where GSettings looks, and checks that
/// they have each value of the table with its type: GSettings would end the process on a value that
/// is missing.
FoundSchemas findSchemas(base::Purpose purpose);

} // namespace quorl::preferences
