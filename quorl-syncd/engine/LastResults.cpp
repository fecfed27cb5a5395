#include "quorl-syncd/engine/LastResults.h"

#include <system_error>

#include <nlohmann/json.hpp>

#include "services/base/AtomicFile.h"

namespace quorl::syncd {

namespace {

using Json = nlohmann::json;

constexpr auto fileName = "last-sync.json";

} // namespace

NLOHMANN_DEFINE_TYPE_NON_INTRUSIVE(LastResult, success, message, time)

LastResults::LastResults(std::filesystem::path directory) : directory_(std::move(directory)) {
    try {
        const auto text = base::readFile(base::openRoot(directory_.c_str()).get(), fileName);
        results_ = Json::parse(text).get<std::map<std::string, LastResult>>();
    } catch (const Json::exception&) {
        results_.clear();
    } catch (const std::system_error&) {
        // Nothing was remembered yet.
    }
}

LastResult LastResults::of(const std::string& wearable) const {
    const auto found = results_.find(wearable);
    return found == results_.end() ? LastResult() : found->second;
}

void LastResults::remember(const std::string& wearable, LastResult result) {
    results_[wearable] = std::move(result);
    base::makeDirectories(directory_);
    const auto text = Json(results_).dump(2, ' ', false, Json::error_handler_t::replace);
    base::replaceFile(base::openRoot(directory_.c_str()).get(), fileName, text + "\n");
}

} // namespace quorl::syncd
