#pragma once

#include "doubles/sessions/SessionDouble.h"

namespace quorl {

/// The sessions of which the service knows, all of them syncs of the device. Main thread.
class SessionServiceDouble {
  public:
    explicit SessionServiceDouble(std::shared_ptr<CallRecorder> recorder)
        : recorder_(std::move(recorder)) {}

    /// Puts others in place of these; announces nothing. A session whose id stays is the same
    /// object, which takes over the figures.
    void replace(const std::vector<SessionDescription>& sessions);

    /// Adds one without tasks; announces nothing.
    std::shared_ptr<SessionDouble> add(const std::string& id);

    [[nodiscard]] NSArray<DVSession> ofType(const std::string& type) const;

    /// The session with this id: of those listed, else of those that were listed and are still in
    /// use; null where there is none.
    [[nodiscard]] std::shared_ptr<SessionDouble> find(const std::string& id) const;

  private:
    std::shared_ptr<CallRecorder> recorder_;
    std::vector<std::shared_ptr<SessionDouble>> listed_;
    std::vector<std::weak_ptr<SessionDouble>> earlier_;
};

} // namespace quorl
