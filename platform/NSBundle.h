#pragma once

#include <memory>
#include <optional>
#include <string>

#include "platform/Class.h"
#include "platform/NSObject.h"

/// A directory of code with its resources: a plug-in, or the program itself.
class NSBundle : public NSObject {
  public:
    /// The bundle that holds the code of `cls`, never null; the program's own for a class of the
    /// program or of the platform.
    [[nodiscard]] static std::shared_ptr<NSBundle> bundleForClass(const Class& cls);

    /// The identifier of the bundle's registration, or null where it has none.
    [[nodiscard]] virtual std::optional<std::string> bundleIdentifier() const = 0;

    /// The text for `key` in the user's language, looked up anew at each call in `table`, or in the
    /// default table where that is null. Without a text for the key: `value`, or `key` itself where
    /// `value` is null or empty.
    [[nodiscard]] virtual std::string
    localizedStringForKey_value_table(const std::string& key,
                                      const std::optional<std::string>& value,
                                      const std::optional<std::string>& table) const = 0;
};
