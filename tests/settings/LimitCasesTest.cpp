// The pane says that those songs fit which the engine sends.

#include "tests/limits/LimitCases.h"

#include <limits>

#include "platform/SizeFormatter.h"
#include "tests/settings/Pane.h"

namespace {

using quorl::SyncPreference;

class LimitOfThePane : public quorl::tests::PaneTest {};

TEST_F(LimitOfThePane, IsTheOneOfTheEngine) {
    chooseMorning();
    sendMorning();
    for (const auto& each : quorl::limits::cases) {
        SCOPED_TRACE(each.situation);
        if (each.amount > std::numeric_limits<NSUInteger>::max()) {
            continue; // the engine knows larger ones than a pane with words of 32 bits
        }
        std::vector<std::optional<std::uint64_t>> sizes;
        for (const auto& listed : each.playlist) {
            sizes.emplace_back(listed.size);
        }
        morning_->setSongSizes(sizes);
        store(SyncPreference::AssetSyncLimitType, each.kind);
        store(SyncPreference::AssetSyncLimit, each.amount);

        showPane();

        const auto count = each.songs == 1 ? "1 song" : std::to_string(each.songs) + " songs";
        EXPECT_EQ(shownFooter("Music Storage"),
                  count + " synced to Velora, taking up " +
                      CPFSSizeStrings(static_cast<float>(each.bytes)) + ".");
    }
}

} // namespace
