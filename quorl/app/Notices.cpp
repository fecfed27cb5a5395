#include "quorl/app/Notices.h"

namespace quorl {

void Notices::set(Topic topic, Notice notice) {
    const auto before = notices_.find(topic);
    const bool isNew = before == notices_.end() || before->second.text != notice.text;
    if (notice.text.empty()) {
        if (notices_.erase(topic) > 0) {
            Q_EMIT changed();
        }
        return;
    }
    const bool isOther = isNew || before->second.actionName != notice.actionName;
    const auto& now = notices_[topic] = std::move(notice);
    if (isNew) {
        Q_EMIT added(now.text);
    }
    if (isOther) {
        Q_EMIT changed();
    }
}

std::vector<std::string> Notices::texts() const {
    std::vector<std::string> texts;
    for (const auto& [topic, notice] : notices_) {
        texts.push_back(notice.text);
    }
    return texts;
}

} // namespace quorl
