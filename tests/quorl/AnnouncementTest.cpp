#include <gmock/gmock.h>

#include "quorl/window/accessible/RowTexts.h"

namespace quorl::tests {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

const RowTexts syncing{QStringLiteral("Road Trip"), QStringLiteral("5% Synced…"), true};

TEST(Announcement, runningPercentageIsNotTold) {
    const RowTexts later{syncing.title, QStringLiteral("16% Synced…"), true};
    EXPECT_THAT(newsOf(syncing, later), IsEmpty());
}

TEST(Announcement, endOfTheSyncIsTold) {
    const RowTexts synced{syncing.title, QStringLiteral("Synced"), true};
    EXPECT_THAT(newsOf(syncing, synced), ElementsAre(QAccessible::DescriptionChanged));
}

TEST(Announcement, checkmarkThatGoesIsTold) {
    const RowTexts unchecked{syncing.title, syncing.value, false};
    EXPECT_THAT(newsOf(syncing, unchecked), ElementsAre(QAccessible::StateChanged));
}

TEST(Announcement, otherPlaylistInThePlaceIsTold) {
    const RowTexts other{QStringLiteral("Road Trip 2"), syncing.value, true};
    EXPECT_THAT(newsOf(syncing, other), ElementsAre(QAccessible::NameChanged));
}

} // namespace

} // namespace quorl::tests
