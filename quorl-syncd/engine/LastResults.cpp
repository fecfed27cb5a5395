#include "quorl-syncd/engine/LastResults.h"

#include <system_error>

#include <nlohmann/json.hpp>

#include "services/base/AtomicFile.h"

namespace quorl::syncd {

namespace {

using Json = nlohmann::json;

constexpr auto fileName = "last-sync.json";

} // namespace

namespace {

/// Earlier engines have kept the sentence alone, and later ones may know more codes.
engine::Message messageIn(const Json& json) {
    engine::Message message{json.value("code", ""),
                            json.value("arguments", std::vector<std::string>())};
    auto text = json.at("message").get<std::string>();
    const bool isKnown = text.empty() || !engine::sentence(message).empty();
    return isKnown ? message : engine::other(std::move(text));
}

} // namespace

/// With the sentence, for earlier engines.
void to_json(Json& json, const LastResult& result) {
    json = {{"success", result.success},   {"message", engine::sentence(result.message)},
            {"code", result.message.code}, {"arguments", result.message.arguments},
            {"time", result.time},         {"lastComplete", result.lastComplete}};
}

void from_json(const Json& json, LastResult& result) {
    const auto success = json.at("success").get<bool>();
    const auto time = json.at("time").get<std::uint64_t>();
    result = {success, messageIn(json), time, json.value("lastComplete", success ? time : 0)};
}

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
