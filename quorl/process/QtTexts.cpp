#include "quorl/process/QtTexts.h"

#include "services/language/Translated.h"

namespace quorl {

QString QtTexts::translate(const char* /*context*/, const char* text,
                           const char* /*disambiguation*/, int /*count*/) const {
    const auto own = language::translated(text);
    return own == text ? QString()
                       : QString::fromStdString(own); // Qt asks the next one for nothing
}

} // namespace quorl
