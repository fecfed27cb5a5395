#include <gmock/gmock.h>

#include "quorl/window/accessible/RowTexts.h"

namespace quorl::tests {

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

const RowTexts syncing{QStringLiteral("Road Trip"), QStringLiteral("5% Synced…"), true};

RowTexts syncedTo(const QString& percentage) {
    return {syncing.title, percentage + QStringLiteral(" Synced…"), true};
}

TEST(Announcement, runningPercentageIsNotTold) {
    EXPECT_THAT(newsOf(syncedTo("5%"), syncedTo("16%")), IsEmpty());
    EXPECT_THAT(newsOf(syncedTo("26%"), syncedTo("49%")), IsEmpty());
}

TEST(Announcement, percentageIsToldAtEveryQuarter) {
    for (const auto& [before, now] :
         {std::pair("24%", "25%"), std::pair("49%", "51%"), std::pair("3%", "75%")}) {
        EXPECT_THAT(newsOf(syncedTo(before), syncedTo(now)),
                    ElementsAre(QAccessible::DescriptionChanged));
    }
}

TEST(Announcement, percentageInArabicDigitsIsToldAtEveryQuarterToo) {
    EXPECT_THAT(newsOf(syncedTo("١٠٪"), syncedTo("٢٤٪")), IsEmpty());
    EXPECT_THAT(newsOf(syncedTo("٢٤٪"), syncedTo("٢٥٪")),
                ElementsAre(QAccessible::DescriptionChanged));
}

TEST(Announcement, numberThatIsNoPercentageIsTold) {
    EXPECT_THAT(newsOf({"Storage", "1 GB free", false}, {"Storage", "2 GB free", false}),
                ElementsAre(QAccessible::DescriptionChanged));
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
