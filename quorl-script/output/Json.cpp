#include "quorl-script/output/Json.h"

#include <nlohmann/json.hpp>

namespace quorl {

namespace {

/// Whether each character of a text stands for itself. All are looked at, so that the compiler can
/// take many at a time.
bool isPlain(std::string_view text) {
    unsigned char others = 0;
    for (const char it : text) {
        const int isOther = (it < ' ') | (it > '~') | (it == '"') | (it == '\\');
        others |= static_cast<unsigned char>(isOther);
    }
    return others == 0;
}

} // namespace

void Json::appendNumber(std::string& text, double value) { text += nlohmann::json(value).dump(); }

void Json::appendText(std::string& text, std::string_view value) {
    if (isPlain(value)) {
        text += '"';
        text += value;
        text += '"';
    } else {
        text +=
            nlohmann::json(value).dump(-1, ' ', false, nlohmann::json::error_handler_t::replace);
    }
}

JsonObject& JsonObject::setAll(const JsonObject& other) {
    const std::string_view members(other.text());
    if (members.size() > 2) {
        insert([members](std::string& text) { text += members.substr(1, members.size() - 2); });
    }
    return *this;
}

} // namespace quorl
