#include "doubles/sessions/SessionServiceDouble.h"

#include "doubles/sessions/ById.h"

namespace quorl {

void SessionServiceDouble::replace(const std::vector<SessionDescription>& sessions) {
    auto before = std::exchange(listed_, {});
    for (const SessionDescription& description : sessions) {
        if (const auto same = takeById(before, description.id)) {
            listed_.push_back(same);
        } else {
            add(description.id);
        }
        listed_.back()->describe(description);
    }
    earlier_.insert(earlier_.begin(), before.begin(), before.end());
    before.clear();
    std::erase_if(earlier_, [](const auto& session) { return session.expired(); });
}

std::shared_ptr<SessionDouble> SessionServiceDouble::add(const std::string& id) {
    return listed_.emplace_back(std::make_shared<SessionDouble>(id, recorder_));
}

NSArray<DVSession> SessionServiceDouble::ofType(const std::string& type) const {
    recorder_->sessionsWillBeListed(type);
    std::vector<std::shared_ptr<DVSession>> sessions;
    if (type == DVSessionTypeDeviceSync) {
        sessions.assign(listed_.begin(), listed_.end());
    }
    return std::make_shared<const std::vector<std::shared_ptr<DVSession>>>(std::move(sessions));
}

std::shared_ptr<SessionDouble> SessionServiceDouble::find(const std::string& id) const {
    for (const auto& session : listed_) {
        if (session->id() == id) {
            return session;
        }
    }
    for (const auto& reference : earlier_) {
        if (auto session = reference.lock(); session && session->id() == id) {
            return session;
        }
    }
    return nullptr;
}

} // namespace quorl
