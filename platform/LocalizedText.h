#pragma once

#include "platform/Foundation.h"

/// A text of a plug-in: its key in the plug-in's default strings table, and its English default.
struct LocalizedText {
    const char* key;
    const char* english;
};

/// The text in the user's language, looked up anew in the bundle of `receiver`'s class.
[[nodiscard]] std::string localized(const NSObject& receiver, const LocalizedText& text);
