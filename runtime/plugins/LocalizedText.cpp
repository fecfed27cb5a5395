#include "platform/LocalizedText.h"

std::string localized(const NSObject& receiver, const LocalizedText& text) {
    return NSBundle::bundleForClass(Class::ofObject(receiver))
        ->localizedStringForKey_value_table(text.key, text.english, std::nullopt);
}
