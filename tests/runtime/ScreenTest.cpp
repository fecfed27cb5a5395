#include <algorithm>
#include <cmath>

#include <gmock/gmock.h>

#include "platform/HostApp.h"
#include "tests/support/TestHost.h"

namespace {

using quorl::tests::TestHost;

struct Alignment {
    CGFloat scale;
    CGRect rect;
    CGRect aligned;
};

class PixelAlignment : public testing::TestWithParam<Alignment> {};

TEST_P(PixelAlignment, MovesTheEdgesOutwardToWholePixels) {
    const CGRect aligned = UIRectIntegralWithScale(GetParam().rect, GetParam().scale);

    EXPECT_FLOAT_EQ(static_cast<float>(aligned.x), static_cast<float>(GetParam().aligned.x));
    EXPECT_FLOAT_EQ(static_cast<float>(aligned.y), static_cast<float>(GetParam().aligned.y));
    EXPECT_FLOAT_EQ(static_cast<float>(aligned.width),
                    static_cast<float>(GetParam().aligned.width));
    EXPECT_FLOAT_EQ(static_cast<float>(aligned.height),
                    static_cast<float>(GetParam().aligned.height));
}

constexpr CGFloat third = CGFloat{1} / 3;
constexpr CGFloat one = 1;
constexpr CGFloat tenth = one / 10;
constexpr CGFloat aboutATenth = one - one * 9 / 10;     ///< a little less
constexpr CGFloat aboutThreeTenths = tenth + tenth * 2; ///< a little more

INSTANTIATE_TEST_SUITE_P(
    Scales, PixelAlignment,
    testing::Values(Alignment{1, {10, 20, 30, 40}, {10, 20, 30, 40}},
                    Alignment{1, {10.2F, 20.9F, 30.5F, 40.1F}, {10, 20, 31, 41}},
                    Alignment{1, {-0.5F, -1.5F, 1, 1}, {-1, -2, 2, 2}},
                    Alignment{1.5F, {1, 2, 2, 1}, {2 * third, 2, 8 * third, 4 * third}},
                    Alignment{2, {10.25F, 10.5F, 10.5F, 0.25F}, {10, 10.5F, 11, 0.5F}},
                    Alignment{2, {10.5F, 0, 0.5F, 0}, {10.5F, 0, 0.5F, 0}},
                    Alignment{3, {third, 2 * third, third, 1}, {third, 2 * third, third, 1}},
                    Alignment{3, {0.1F, 0.4F, 0.5F, 0.5F}, {0, third, 2 * third, 2 * third}},
                    Alignment{
                        10, {aboutATenth, 0, 1, aboutThreeTenths}, {tenth, 0, 1, 3 * tenth}}));

TEST(PixelAlignmentProperties, TakesWhatIsFurtherOffThanAnErrorOfTheCalculationSerious) {
    const CGFloat off = sizeof(CGFloat) == sizeof(double) ? CGFloat(1e-4) : CGFloat(1e-2);
    EXPECT_EQ(UIRectIntegralWithScale({0, 0, 1 + off, 1}, 1).width, 2);
}

TEST(PixelAlignmentProperties, LiesOnWholePixelsAndHoldsWhatItWasGiven) {
    for (const CGFloat scale : {CGFloat{1}, CGFloat{1.5}, CGFloat{2}, CGFloat{3}}) {
        for (int step = -40; step < 40; ++step) {
            const CGFloat offset = static_cast<CGFloat>(step) * static_cast<CGFloat>(0.137);
            const CGRect rect{offset, -offset, static_cast<CGFloat>(17.3), static_cast<CGFloat>(4)};

            const CGRect aligned = UIRectIntegralWithScale(rect, scale);

            for (const CGFloat edge :
                 {aligned.x, aligned.y, aligned.x + aligned.width, aligned.y + aligned.height}) {
                EXPECT_NEAR(edge * scale, std::nearbyint(edge * scale), 1e-3);
            }
            EXPECT_LE(aligned.x, rect.x + static_cast<CGFloat>(1e-3));
            EXPECT_LE(aligned.y, rect.y + static_cast<CGFloat>(1e-3));
            EXPECT_GE(aligned.x + aligned.width, rect.x + rect.width - static_cast<CGFloat>(1e-3));
            EXPECT_GE(aligned.y + aligned.height,
                      rect.y + rect.height - static_cast<CGFloat>(1e-3));
        }
    }
}

class Screens : public testing::Test {
  protected:
    std::shared_ptr<UITableViewCell> cell(UITableViewCellStyle style) {
        return create<UITableViewCell>(&UITableViewCell::initWithStyle_reuseIdentifier, style, "");
    }

    std::shared_ptr<TestHost> host_ = TestHost::installed();
};

TEST_F(Screens, GiveTheirScaleAndColoursToPanes) {
    host_->screen().looks.scale = 3;
    host_->screen().looks.textColor = "#123456";

    EXPECT_EQ(UIScreen::mainScreen().scale(), 3);
    EXPECT_EQ(PSListController::appearance().textColor, "#123456");
    EXPECT_EQ(QPSQuorlTintColor(), "tint");
}

TEST_F(Screens, MeasureLabelsWithinTheSizeGiven) {
    const auto row = cell(UITableViewCellStyle::Value1);
    UILabel& label = row->textLabel();
    label.setText("four");

    EXPECT_EQ(label.sizeThatFits({1000, 1000}), (CGSize{40, 20}));
    EXPECT_EQ(label.sizeThatFits({25, 5}), (CGSize{25, 5}));
    label.setText(std::nullopt);
    EXPECT_EQ(label.sizeThatFits({1000, 1000}), (CGSize{0, 0}));
}

TEST_F(Screens, GiveACellTheDefaultStyleWhereNoneIsSaid) {
    EXPECT_EQ(create<UITableViewCell>()->style(), UITableViewCellStyle::Default);
}

TEST_F(Screens, LayTitleAndDetailOutSideBySide) {
    const auto row = cell(UITableViewCellStyle::Value1);
    row->textLabel().setText("title");
    row->detailTextLabel().setText("detail");

    row->layoutSubviews();

    EXPECT_EQ(row->textLabel().frame(), (CGRect{16, 12, 50, 20}));
    EXPECT_EQ(row->detailTextLabel().frame(), (CGRect{320 - 16 - 60, 12, 60, 20}));
}

TEST_F(Screens, MakeRoomForACheckmark) {
    const auto row = cell(UITableViewCellStyle::Value1);
    row->detailTextLabel().setText("detail");
    row->layoutSubviews();
    const CGFloat before = row->detailTextLabel().frame().x;

    row->setAccessoryType(UITableViewCellAccessoryType::Checkmark);
    row->layoutSubviews();

    EXPECT_LT(row->detailTextLabel().frame().x, before);
}

TEST_F(Screens, GiveALongTitleTheWidthBesideAnEmptyDetail) {
    const auto row = cell(UITableViewCellStyle::Value1);
    row->textLabel().setText(std::string(100, 'x'));

    row->layoutSubviews();

    EXPECT_EQ(row->textLabel().frame().width, 320 - 2 * 16);
}

TEST_F(Screens, KeepAGapBetweenALongTitleAndItsDetail) {
    for (const std::size_t length : {22U, 25U, 28U, 29U, 100U}) {
        const auto row = cell(UITableViewCellStyle::Value1);
        row->textLabel().setText(std::string(length, 'x'));
        row->detailTextLabel().setText("detail");

        row->layoutSubviews();

        const CGRect title = row->textLabel().frame();
        const CGRect detail = row->detailTextLabel().frame();
        EXPECT_EQ(title.width, std::min(static_cast<CGFloat>(10 * length), CGFloat{280}));
        EXPECT_EQ(detail.x, title.x + title.width + 8);
        EXPECT_EQ(detail.x + detail.width, 320 - 16);
    }
}

TEST_F(Screens, LayTheSubtitleOutBelowTheTitle) {
    const auto row = cell(UITableViewCellStyle::Subtitle);
    row->textLabel().setText("title");
    row->detailTextLabel().setText("detail");

    row->layoutSubviews();

    EXPECT_EQ(row->textLabel().frame(), (CGRect{16, 2, 50, 20}));
    EXPECT_EQ(row->detailTextLabel().frame(), (CGRect{16, 22, 60, 20}));

    row->textLabel().setText(std::string(100, 'x'));
    row->detailTextLabel().setText(std::string(100, 'x'));
    row->layoutSubviews();
    EXPECT_EQ(row->textLabel().frame(), (CGRect{16, 2, 320 - 2 * 16, 20}));
    EXPECT_EQ(row->detailTextLabel().frame(), (CGRect{16, 22, 320 - 2 * 16, 20}));
}

class AnyList : public PSListController {};

class AnyTable : public UITableViewController {
  public:
    NSInteger numberOfSectionsInTableView(UITableView& /*tableView*/) override { return 0; }

    NSInteger tableView_numberOfRowsInSection(UITableView& /*tableView*/,
                                              NSInteger /*section*/) override {
        return 0;
    }

    std::shared_ptr<UITableViewCell>
    tableView_cellForRowAtIndexPath(UITableView& /*tableView*/,
                                    const NSIndexPath& /*path*/) override {
        return nullptr;
    }

    void tableView_didSelectRowAtIndexPath(UITableView& /*tableView*/,
                                           const NSIndexPath& /*path*/) override {}
};

TEST(WithoutAHost, NoPaneIsMade) {
    EXPECT_EQ(create<AnyList>(), nullptr);
    EXPECT_EQ(create<AnyTable>(), nullptr);
}

TEST(WithoutAHost, AControllerMayComeAndGo) {
    const auto controller = create<UIViewController>();
    controller->viewWillAppear(false);
    controller->viewWillDisappear(false);
}

TEST(WithoutAHost, TheUseOfAServiceEndsTheProcessWithAMessage) {
    EXPECT_DEATH((void)LMSyncDefaults::sharedDefaults(), "before a host was installed");
}

TEST(WithoutAHost, ThereIsANotificationCentre) {
    EXPECT_EQ(&NSNotificationCenter::defaultCenter(), &NSNotificationCenter::defaultCenter());
}

TEST(WithAHost, PanesAreMade) {
    const auto host = TestHost::installed();

    EXPECT_NE(create<AnyList>(), nullptr);
    const auto table = create<AnyTable>();
    ASSERT_NE(table, nullptr);
    EXPECT_EQ(table->style(), UITableViewStyle::Plain);
}

TEST(WithAHost, TheClockIsTheHosts) {
    const auto host = TestHost::installed();
    const auto earlier = NSDate::date();

    host->clock.moveBy(std::chrono::seconds(481));

    EXPECT_EQ(NSDate::date()->timeIntervalSinceDate(*earlier), 481.0);
    EXPECT_EQ(earlier->timeIntervalSinceDate(*NSDate::date()), -481.0);
}

} // namespace
