// A sentence about a session is believed where what it names was in the way then.

#include "quorl-simulate/Troubles.h"

#include <gtest/gtest.h>

namespace {

using namespace quorl::simulation;
using namespace std::chrono_literals;

constexpr auto full = "The Velora is full. Remove something from it, or choose a lower limit.";
constexpr Troubles::TimePoint begin(1h);

TEST(Troubles, ExplainWhatWasInTheWayDuringTheSession) {
    Troubles troubles;
    troubles.sessionBegins(begin);
    troubles.note(Trouble::Full, begin + 1min);

    EXPECT_TRUE(troubles.explain(full));
    EXPECT_FALSE(troubles.explain("The sync was cancelled."));
}

TEST(Troubles, ExplainWhatTheEngineHeardOfTooLate) {
    Troubles troubles;
    troubles.note(Trouble::Full, begin);

    troubles.sessionBegins(begin + 500ms);
    EXPECT_TRUE(troubles.explain(full));
    troubles.sessionBegins(begin + 2s);
    EXPECT_FALSE(troubles.explain(full));
}

TEST(Troubles, ExplainASuccessAndNothingThatIsNotKnown) {
    const Troubles troubles;

    EXPECT_TRUE(troubles.explain("3 songs synced to Velora."));
    EXPECT_FALSE(troubles.explain("The Velora could not be synced: Invalid argument."));
    EXPECT_FALSE(troubles.explain("std::bad_alloc"));
}

} // namespace
