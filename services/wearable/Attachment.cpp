#include "services/wearable/Attachment.h"

#include <system_error>

#include <nlohmann/json.hpp>

#include "services/base/AtomicFile.h"
#include "services/wearable/Wearable.h"

namespace quorl::wearable {

namespace {

constexpr auto fileName = "state.json";

/// Far more than is ever saved. The device may have been in other hands, and what would fill the
/// memory must not be read.
constexpr std::size_t mostBytes = 4096;

} // namespace

Attachment loadAttachment(int root) {
    try {
        const auto text =
            base::readFile(root, std::string{ownDirectory} + "/" + fileName, mostBytes);
        const auto value = nlohmann::json::parse(text);
        return {value.at("connected").get<bool>(), value.at("onCharger").get<bool>()};
    } catch (const nlohmann::json::exception&) {
        return {};
    } catch (const std::system_error&) {
        return {};
    }
}

void saveAttachment(int root, const Attachment& attachment) {
    const nlohmann::json value{{"connected", attachment.connected},
                               {"onCharger", attachment.onCharger}};
    base::replaceFile(base::openDirectory(root, ownDirectory).get(), fileName, value.dump() + "\n");
}

} // namespace quorl::wearable
