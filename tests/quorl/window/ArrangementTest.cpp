#include <QHelpEvent>
#include <QScrollBar>
#include <QTest>
#include <QToolButton>
#include <QToolTip>

#include <gmock/gmock.h>

#include "quorl/content/SwitchCell.h"
#include "quorl/window/cells/CellArrangement.h"
#include "tests/quorl/window/ShownTable.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

constexpr qreal gap = 8;

/// A row as wide as that of a window of the parameter's width, on a screen of its scale, with a
/// font of its size.
struct Room {
    int window = 360;
    double scale = 1;
    int fontSize = 15;
};

void PrintTo(const Room& room, std::ostream* output) {
    *output << room.window << " points, scale " << room.scale << ", font " << room.fontSize;
}

class Arrangement : public testing::TestWithParam<Room> {
  protected:
    Arrangement() {
        QFont font;
        font.setPixelSize(GetParam().fontSize);
        screen_.setFont(font);
        screen_.setGeometry(std::min(GetParam().window - 32, 640), GetParam().scale);
        Host::install(host_);
    }

    ~Arrangement() override { Host::install(nullptr); }

    CellArrangement arranged(UITableViewCell& cell) const {
        const CGSize row = screen_.rowSize();
        return CellArrangement::of(
            cell, QSizeF(static_cast<qreal>(row.width), static_cast<qreal>(row.height)),
            screen_.font());
    }

    static std::shared_ptr<UITableViewCell> cellOf(const std::string& name,
                                                   const std::string& value) {
        auto cell = ::create<UITableViewCell>(&UITableViewCell::initWithStyle_reuseIdentifier,
                                              UITableViewCellStyle::Value1, std::string());
        cell->textLabel().setText(name);
        cell->detailTextLabel().setText(value.empty() ? std::nullopt : std::optional(value));
        cell->setAccessoryType(UITableViewCellAccessoryType::Checkmark);
        cell->layoutSubviews();
        return cell;
    }

    /// As a pane does that lets its value have what it needs.
    void widenValue(UITableViewCell& cell) const {
        CGRect value = cell.detailTextLabel().frame();
        CGRect name = cell.textLabel().frame();
        const CGFloat missing = screen_.sizeOfText(cell.detailTextLabel()).width - value.width;
        value.x -= missing;
        value.width += missing;
        name.width -= missing;
        cell.detailTextLabel().setFrame(value);
        cell.textLabel().setFrame(name);
    }

    WindowScreen screen_;
    Notices notices_;
    std::shared_ptr<CompanionHost> host_ =
        std::make_shared<CompanionHost>(Places{}, screen_, notices_);
};

TEST_P(Arrangement, nameAndStatusStayApart) {
    for (const std::string& name :
         {std::string("Run"), std::string("Long Run in the Rain"),
          std::string("Quiet music for long Sunday mornings with coffee"),
          std::string("Donaudampfschifffahrtsgesellschaftskapitaenslieder")}) {
        auto cell = cellOf(name, "16% Synced…");
        widenValue(*cell);
        const auto texts = arranged(*cell);
        EXPECT_TRUE(texts.isStacked || texts.title.place.right() + gap <= texts.value.place.left())
            << name;
        EXPECT_GE(texts.title.place.width(), 0);
    }
}

TEST_P(Arrangement, everythingIsWithinTheRow) {
    auto cell = cellOf("Quiet music for long Sunday mornings with coffee", "Sync Pending…");
    const auto texts = arranged(*cell);
    const QRectF row(0, 0, static_cast<qreal>(screen_.rowSize().width),
                     static_cast<qreal>(screen_.rowSize().height));
    EXPECT_TRUE(row.contains(texts.title.place));
    EXPECT_TRUE(row.contains(texts.value.place));
}

TEST_P(Arrangement, nameThatFitsInTwoLinesIsWhole) {
    auto cell = cellOf("Evening Songs for Friends", "");
    const auto texts = arranged(*cell);
    EXPECT_TRUE(texts.isWhole);
    EXPECT_EQ(texts.title.lines.join(u' '), "Evening Songs for Friends");
}

TEST_P(Arrangement, nameThatFitsNowhereIsShortenedAtItsEnd) {
    const std::string name(400, 'n');
    auto cell = cellOf(name, "Synced");
    const auto texts = arranged(*cell);
    EXPECT_FALSE(texts.isWhole);
    EXPECT_TRUE(texts.title.lines.back().endsWith(QStringLiteral("…")));
    EXPECT_EQ(texts.value.lines, QStringList{"Synced"});
}

TEST_P(Arrangement, nameOfASwitchEndsBeforeIt) {
    auto cell = ::create<SwitchCell>(&UITableViewCell::initWithStyle_reuseIdentifier,
                                     UITableViewCellStyle::Value1, std::string());
    cell->textLabel().setText("Start when I log in and stay out of the way until then");
    cell->layoutSubviews();
    const auto texts = arranged(*cell);
    EXPECT_LE(texts.title.place.right(),
              static_cast<qreal>(screen_.rowSize().width) - 16 - 44 - gap);
}

INSTANTIATE_TEST_SUITE_P(Rooms, Arrangement,
                         testing::Values(Room{320, 1, 15}, Room{360, 1.25, 15}, Room{360, 1.5, 15},
                                         Room{360, 2, 15}, Room{400, 3, 15}, Room{720, 1, 15},
                                         Room{1200, 1, 15}, Room{320, 1, 30}, Room{360, 2, 30},
                                         Room{1200, 1.5, 30}));

class PhoneArrangement : public Arrangement {};

TEST_P(PhoneArrangement, longNameTakesTwoLinesBesideItsStatus) {
    auto cell = cellOf("Quiet Songs for Sunday Mornings", "Synced");
    widenValue(*cell);
    const auto texts = arranged(*cell);
    EXPECT_FALSE(texts.isStacked);
    EXPECT_EQ(texts.title.lines.size(), 2);
    EXPECT_TRUE(texts.isWhole);
}

TEST_P(PhoneArrangement, nameOfOneLongWordHasItsStatusBelow) {
    auto cell = cellOf("Sonntagmorgenfruehstuecksmu", "Sync Pending…");
    widenValue(*cell);
    const auto texts = arranged(*cell);
    EXPECT_TRUE(texts.isStacked);
    EXPECT_TRUE(texts.isWhole);
}

INSTANTIATE_TEST_SUITE_P(Rooms, PhoneArrangement, testing::Values(Room{360, 1, 15}));

TEST(Header, titleThatIsShortenedIsToldWhole) {
    Window window;
    window.widget().resize(320, 600);
    window.click(0);
    const auto& label = *window.widget().findChild<HeaderBar*>()->findChild<QLabel*>();
    EXPECT_EQ(label.text(), "Synced Playlist");
    EXPECT_EQ(label.accessibleName(), "Synced Playlist");
    EXPECT_TRUE(label.toolTip().isEmpty());
    QFont large = window.screen().font();
    large.setPixelSize(60);
    window.widget().setFont(large);
    QCoreApplication::processEvents();
    EXPECT_TRUE(label.text().endsWith(QStringLiteral("…")));
    EXPECT_EQ(label.accessibleName(), "Synced Playlist");
    EXPECT_EQ(label.toolTip(), "Synced Playlist");
}

TEST(Header, backButtonGivesWayToTheTitle) {
    Window window;
    window.widget().resize(320, 600);
    window.click(0);
    auto& back = *window.widget().findChild<QToolButton*>(QStringLiteral("back"));
    EXPECT_EQ(back.text(), "Music");
    QFont large = window.screen().font();
    large.setPixelSize(26);
    window.widget().setFont(large);
    QCoreApplication::processEvents();
    const auto& label = *window.widget().findChild<HeaderBar*>()->findChild<QLabel*>();
    EXPECT_EQ(label.text(), "Synced Playlist");
    EXPECT_EQ(back.text(), "");
    EXPECT_EQ(back.accessibleName(), "Back to Music");
}

TEST(RowToolTip, tellsTheWholeNameWhereItIsShortened) {
    const std::string name = "A name " + std::string(100, 'm');
    ShownTable shown({name, "Short"});
    const auto hoverOver = [&shown](NSInteger row) {
        const auto place = shown.view().onViewport(shown.view().layout().rowRect(row)).center();
        QHelpEvent event(QEvent::ToolTip, place.toPoint(),
                         shown.view().viewport()->mapToGlobal(place.toPoint()));
        QCoreApplication::sendEvent(shown.view().viewport(), &event);
    };
    hoverOver(0);
    EXPECT_EQ(QToolTip::text().toStdString(), name);
    hoverOver(1);
    EXPECT_TRUE(QTest::qWaitFor([] { return !QToolTip::isVisible(); }, 60'000));
}

class Sizes : public testing::TestWithParam<std::tuple<QSize, int>> {};

TEST_P(Sizes, paneIsUsableInAWindowOfThatSize) {
    const auto [size, fontSize] = GetParam();
    Window window;
    QFont font = window.screen().font();
    font.setPixelSize(fontSize);
    window.screen().setFont(font);
    window.widget().setFont(font);
    window.widget().resize(size);
    QCoreApplication::processEvents();
    EXPECT_EQ(window.widget().size(), size);
    EXPECT_EQ(window.view().horizontalScrollBar()->maximum(), 0);
    for (NSInteger row = 0; row < window.view().layout().rowCount(); ++row) {
        const QRectF place = window.view().layout().rowRect(row);
        EXPECT_GE(place.left(), 0);
        EXPECT_LE(place.right(), size.width());
        const auto cell = window.view().content().cell(row);
        EXPECT_TRUE(CellArrangement::of(*cell, place.size(), window.screen().font()).isWhole);
    }
    window.view().setCurrentRow(1);
    EXPECT_TRUE(QRectF(window.view().viewport()->rect())
                    .contains(window.view().onViewport(window.view().layout().rowRect(1))));
}

INSTANTIATE_TEST_SUITE_P(Window, Sizes,
                         testing::Combine(testing::Values(QSize(320, 480), QSize(360, 720),
                                                          QSize(720, 320), QSize(1200, 800)),
                                          testing::Values(15, 30)));

} // namespace

} // namespace quorl::tests
