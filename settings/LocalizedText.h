#pragma once

#include "platform/Foundation.h"

/// A text of this plug-in: its key in the default strings table, and its English default.
struct LocalizedText {
    const char* key;
    const char* english;
};

/// The text in the user's language, looked up anew in the bundle of `receiver`'s class.
[[nodiscard]] std::string localized(const NSObject& receiver, const LocalizedText& text);
