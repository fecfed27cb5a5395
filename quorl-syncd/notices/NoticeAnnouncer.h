#pragma once

#include <functional>

#include "quorl-syncd/engine/ports/Announcer.h"
#include "quorl-syncd/notices/NoticeBoard.h"
#include "quorl-syncd/notices/NoticePolicy.h"

namespace quorl::syncd {

/// Tells clients what the engine does, and a person at the desktop what is worth telling of it.
/// Everything is called in turns of the engine.
class NoticeAnnouncer final : public Announcer {
  public:
    /// All of these outlive the announcer.
    NoticeAnnouncer(Announcer& clients, const Clock& clock, NoticeBoard& board);

    /// What an engine tells its clients at this moment.
    using Status = std::function<const engine::EngineStatus&()>;

    /// Begins to tell a person of the engine that has this status, and tells this announcer of its
    /// changes. What became of earlier syncs is not told.
    void follow(Status status);

    /// Whether a person sees on the screen how the engine does. A notice that is there is withdrawn
    /// then; what was seen is not told afterwards.
    void setWatched(bool isWatched);

    /// Whether there may be notices at all.
    void setWanted(bool isWanted);

    void stateDidChange() override;

    [[nodiscard]] std::unique_ptr<SessionReport>
    beginSession(std::uint64_t number, std::function<void()> cancel) override;

  private:
    class Report;

    void consider(const std::optional<EndedSync>& ended = {});

    Announcer& clients_;
    const Clock& clock_;
    NoticeBoard& board_;
    Status status_; ///< empty as long as no engine is followed
    bool isWatched_ = false;
    bool isWanted_ = true;
    Brought brought_ = Brought::Nothing; ///< by the sync that is under way
    std::optional<EndedSync> ended_;     ///< and its result is not published yet
    NoticeMemory memory_;
};

} // namespace quorl::syncd
