// What a host does unless it overrides it, as far as that takes the rooms above runtime/host.

#include "runtime/host/Host.h"
#include "runtime/objects/NotificationCenter.h"
#include "runtime/plugins/StringTable.h"
#include "runtime/services/SizeText.h"

namespace quorl {

NSNotificationCenter& Host::notificationCenter() { return NotificationCenter::processWide(); }

std::vector<std::string> Host::languages() { return environmentLanguages(); }

std::optional<std::string> Host::textForKey(const StringTable& table, const std::string& key,
                                            const std::optional<std::string>& /*value*/) {
    return table.text(languages(), StringTable::defaultDomain, key);
}

std::string Host::sizeText(float bytes) {
    return quorl::sizeText(static_cast<double>(bytes), languages().front());
}

} // namespace quorl
