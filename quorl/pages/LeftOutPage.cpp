#include "quorl/pages/LeftOutPage.h"

#include <map>

#include "services/base/Utf8.h"
#include "services/engine/Message.h"
#include "services/language/Translated.h"

namespace quorl {

using language::translated;

bool LeftOutPage::init() {
    setTitle(translated("Could Not Be Sent"));
    return AppPage::init();
}

AppPage::Rows LeftOutPage::rows() {
    const auto& engine = state().engine;
    std::map<std::string, std::vector<std::string>> entriesByReason;
    for (const auto& item : engine.leftOut) {
        entriesByReason[item.get<1>()].push_back(item.get<0>());
    }
    Rows rows;
    for (const auto& [reason, entries] : entriesByReason) {
        rows.push_back(group(std::nullopt, engine::sentence({reason, {}})));
        for (const auto& entry : entries) {
            rows.push_back(value(entry.empty() ? translated("An entry without a name")
                                               : base::printable(entry),
                                 {}));
        }
    }
    const auto others =
        engine.leftOutCount - std::min<std::uint64_t>(engine.leftOutCount, engine.leftOut.size());
    if (rows.empty()) {
        rows.push_back(group(std::nullopt, translated("Every song of the playlist can be sent.")));
    } else if (others > 0) {
        rows.push_back(group(std::nullopt, language::translatedCount("And {count} more.",
                                                                     "And {count} more.", others)));
    }
    return rows;
}

} // namespace quorl
