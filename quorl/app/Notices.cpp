#include "quorl/app/Notices.h"

namespace quorl {

void Notices::set(Topic topic, const std::string& text) {
    std::string& current = texts_[topic];
    if (current == text) {
        return;
    }
    current = text;
    if (!text.empty()) {
        Q_EMIT added(text);
    }
    Q_EMIT changed();
}

std::vector<std::string> Notices::texts() const {
    std::vector<std::string> texts;
    for (const auto& [topic, text] : texts_) {
        if (!text.empty()) {
            texts.push_back(text);
        }
    }
    return texts;
}

} // namespace quorl
