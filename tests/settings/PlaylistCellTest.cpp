#include <gmock/gmock.h>

#include "settings/LMQuorlPlaylistCell.h"
#include "tests/support/TestHost.h"

namespace {

using quorl::tests::TestHost;
using testing::ElementsAre;
using testing::IsEmpty;

class PlaylistCell : public testing::Test {
  protected:
    /// Lays a row out whose standard layout is this and whose detail text needs `needed` points.
    void layOut(const CGRect& title, const CGRect& detail, CGFloat needed) {
        const auto labels = host_->screen().tryLayout(*cell_, {title, detail, needed, scale_});
        for (const UILabel* label : labels) {
            placed_.emplace_back(label == &cell_->textLabel() ? "name" : "status");
        }
    }

    [[nodiscard]] CGRect title() const { return cell_->textLabel().frame(); }

    [[nodiscard]] CGRect detail() const { return cell_->detailTextLabel().frame(); }

    std::shared_ptr<TestHost> host_ = TestHost::installed();
    std::shared_ptr<LMQuorlPlaylistCell> cell_ = create<LMQuorlPlaylistCell>(
        &LMQuorlPlaylistCell::initWithStyle_reuseIdentifier, UITableViewCellStyle::Value1, "PC");
    CGFloat scale_ = 1;
    std::vector<std::string> placed_; ///< what the cell placed by itself, in order
};

TEST_F(PlaylistCell, KeepsTheStandardLayoutUnroundedWhereTheStatusFits) {
    const CGRect standardTitle{16.25F, 12.5F, 50.75F, 20.25F};
    const CGRect standardDetail{70.25F, 12.5F, 60.5F, 20.25F};

    for (const CGFloat needed : {60.0F, 60.5F}) {
        layOut(standardTitle, standardDetail, needed);

        EXPECT_EQ(title(), standardTitle);
        EXPECT_EQ(detail(), standardDetail);
        EXPECT_THAT(placed_, IsEmpty());
    }
}

TEST_F(PlaylistCell, TakesFromTheNameLessThanAPoint) {
    scale_ = 2;

    layOut({16, 12, 180, 20}, {200, 12, 60, 20}, 60.5F);

    EXPECT_EQ(detail(), (CGRect{199.5F, 12, 60.5F, 20}));
    EXPECT_EQ(title(), (CGRect{16, 12, 179.5F, 20}));
}

TEST_F(PlaylistCell, TakesFromTheNameWhatTheStatusLacks) {
    layOut({16, 12, 180, 20}, {200, 13, 60, 18}, 100);

    EXPECT_EQ(detail(), (CGRect{160, 13, 100, 18}));
    EXPECT_EQ(title(), (CGRect{16, 12, 140, 20}));
}

TEST_F(PlaylistCell, KeepsTheGapThatTheRuntimeLeavesBesideALongName) {
    cell_->textLabel().setText(std::string(100, 'n'));
    cell_->detailTextLabel().setText("Synced");

    cell_->layoutSubviews();

    EXPECT_EQ(detail().width, 60);
    EXPECT_EQ(detail().x, title().x + title().width + 8);
}

TEST_F(PlaylistCell, LetsTheStatusBeginNoFurtherLeftThan80) {
    layOut({16, 12, 100, 20}, {120, 12, 60, 20}, 150);

    EXPECT_EQ(detail(), (CGRect{80, 12, 100, 20}));
    EXPECT_EQ(title(), (CGRect{16, 12, 60, 20}));
}

TEST_F(PlaylistCell, LetsTheStatusReach80Exactly) {
    layOut({16, 12, 100, 20}, {120, 12, 60, 20}, 100);

    EXPECT_EQ(detail(), (CGRect{80, 12, 100, 20}));
}

TEST_F(PlaylistCell, MovesAStatusThatBeganLeftOf80ToTheRight) {
    layOut({16, 12, 40, 20}, {60, 12, 90, 20}, 150);

    EXPECT_EQ(detail(), (CGRect{80, 12, 70, 20}));
    EXPECT_EQ(title(), (CGRect{16, 12, 60, 20}));
}

TEST_F(PlaylistCell, GivesTheNameLessThanNothingWithoutAFloor) {
    layOut({16, 12, 30, 20}, {250, 12, 10, 20}, 150);

    EXPECT_EQ(detail(), (CGRect{110, 12, 150, 20}));
    EXPECT_EQ(title(), (CGRect{16, 12, -110, 20}));
}

TEST_F(PlaylistCell, AlignsBothToWholePixelsAfterwards) {
    scale_ = 2;

    layOut({16, 12, 100.3F, 20}, {200.3F, 12.2F, 59.8F, 20}, 70);

    EXPECT_EQ(detail(), UIRectIntegralWithScale(
                            {detail().x, detail().y, detail().width, detail().height}, 2));
    EXPECT_NEAR(detail().x, 190.0, 1e-6);
    EXPECT_NEAR(detail().y, 12.0, 1e-6);
    EXPECT_NEAR(detail().width, 70.5, 1e-6) << "outward, so that the text still fits";
    EXPECT_NEAR(title().x, 16.0, 1e-6);
    EXPECT_NEAR(title().width, 90.5, 1e-6);
}

TEST_F(PlaylistCell, PlacesTheStatusBeforeTheName) {
    layOut({16, 12, 180, 20}, {200, 12, 20, 20}, 40);

    EXPECT_THAT(placed_, ElementsAre("status", "name"));
    EXPECT_EQ(detail(), (CGRect{180, 12, 40, 20}));
    EXPECT_EQ(title(), (CGRect{16, 12, 160, 20}));
}

TEST_F(PlaylistCell, KeepsTheStatusWholeBesideALongNameInTheStandardLayoutOfTheRuntime) {
    cell_->textLabel().setText(std::string(100, 'n'));
    cell_->detailTextLabel().setText("Sync Pending");
    cell_->setAccessoryType(UITableViewCellAccessoryType::Checkmark);

    cell_->layoutSubviews();

    EXPECT_EQ(detail().width, 120);
    EXPECT_EQ(detail().x + detail().width, 320 - 16 - 28);
    EXPECT_LE(title().x + title().width, detail().x) << "one covers the other";
}

} // namespace
