#include <QImage>
#include <cmath>
#include <limits>

#include <gmock/gmock.h>

#include "quorl/app/CompanionHost.h"
#include "quorl/window/cells/CellPainter.h"
#include "quorl/window/cells/WrappedText.h"
#include "quorl/window/look/WindowScreen.h"

namespace quorl::tests {

namespace {

constexpr qreal width = 328;

/// A row with a title at its start and a value at its end, on a screen of the given scale.
class CellLayout : public testing::TestWithParam<double> {
  protected:
    CellLayout() {
        screen_.setGeometry(width, GetParam());
        Host::install(host_);
    }

    ~CellLayout() override { Host::install(nullptr); }

    static std::shared_ptr<UITableViewCell> cellOf(const std::string& title,
                                                   const std::string& value) {
        auto cell = ::create<UITableViewCell>(&UITableViewCell::initWithStyle_reuseIdentifier,
                                              UITableViewCellStyle::Value1, std::string());
        cell->textLabel().setText(title);
        cell->detailTextLabel().setText(value);
        cell->layoutSubviews();
        return cell;
    }

    /// As near as a length of the platform can be, which has 32 bits where words have.
    [[nodiscard]] bool isOnPixels(CGFloat length) const {
        const double pixels = static_cast<double>(length) * GetParam();
        const double step = static_cast<double>(std::numeric_limits<CGFloat>::epsilon());
        return std::abs(pixels - std::round(pixels)) <= 4 * step * std::abs(pixels);
    }

    WindowScreen screen_;
    Notices notices_;
    std::shared_ptr<CompanionHost> host_ =
        std::make_shared<CompanionHost>(Places{}, screen_, notices_);
};

TEST_P(CellLayout, labelsAreOnWholeDevicePixels) {
    const auto cell = cellOf("Road Trip", "Sync Pending…");
    for (const UILabel* label : {&cell->textLabel(), &cell->detailTextLabel()}) {
        const CGRect frame = label->frame();
        for (const CGFloat length : {frame.x, frame.y, frame.width, frame.height}) {
            EXPECT_TRUE(isOnPixels(length)) << length;
        }
    }
}

TEST_P(CellLayout, valueEndsAtTheMarginAndTitleBeginsThere) {
    const auto cell = cellOf("Road Trip", "Synced");
    const CGRect value = cell->detailTextLabel().frame();
    EXPECT_NEAR(static_cast<double>(value.x + value.width), width - 16, 1);
    EXPECT_NEAR(static_cast<double>(cell->textLabel().frame().x), 16, 1);
}

TEST_P(CellLayout, whatFitsIsGivenItsWholeWidth) {
    const auto cell = cellOf("Road Trip", "Synced");
    for (UILabel* label : {&cell->textLabel(), &cell->detailTextLabel()}) {
        EXPECT_GE(label->frame().width + 1e-6, screen_.sizeOfText(*label).width);
    }
}

TEST_P(CellLayout, rowIsAtLeastAsHighAsAFinger) {
    EXPECT_GE(screen_.rowHeight(), 44);
    EXPECT_TRUE(isOnPixels(static_cast<CGFloat>(screen_.rowHeight())));
}

INSTANTIATE_TEST_SUITE_P(Scales, CellLayout, testing::Values(1.0, 1.5, 2.0, 3.0));

TEST(WrappedText, isOfItsFontAndItsWidth) {
    const QString text = QStringLiteral("Songs that are not on the wearable");
    QFont small;
    small.setPixelSize(10);
    QFont large;
    large.setPixelSize(40);
    const auto inSmall = wrappedLines(text, small, width);
    EXPECT_EQ(inSmall.size(), 1);
    EXPECT_GT(wrappedLines(text, large, width).size(), 1);
    EXPECT_GT(wrappedLines(text, small, 60).size(), 1);
    EXPECT_EQ(wrappedLines(text, small, width), inSmall);
}

} // namespace

} // namespace quorl::tests
