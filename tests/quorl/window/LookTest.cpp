#include <QImage>
#include <cmath>

#include <gmock/gmock.h>

#include "quorl/window/look/PaneColors.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

double linear(int part) {
    const double share = part / 255.0;
    return share <= 0.04045 ? share / 12.92 : std::pow((share + 0.055) / 1.055, 2.4);
}

double brightness(const QColor& color) {
    return 0.2126 * linear(color.red()) + 0.7152 * linear(color.green()) +
           0.0722 * linear(color.blue());
}

/// By the definition of WCAG, reckoned from what a screen shows.
double contrast(const QColor& one, const QColor& other) {
    const double bright = std::max(brightness(one), brightness(other));
    const double dark = std::min(brightness(one), brightness(other));
    return (bright + 0.05) / (dark + 0.05);
}

QPalette paletteOf(const QColor& window, const QColor& base, const QColor& text) {
    QPalette palette(window);
    palette.setColor(QPalette::Window, window);
    palette.setColor(QPalette::Base, base);
    palette.setColor(QPalette::WindowText, text);
    return palette;
}

struct Case {
    const char* name;
    QPalette palette;
    Look look;
};

void PrintTo(const Case& tried, std::ostream* output) { *output << tried.name; }

std::vector<Case> cases() {
    const QPalette light = paletteOf(QColor(0xef, 0xef, 0xef), Qt::white, Qt::black);
    const QPalette sand =
        paletteOf(QColor(0xf5, 0xe9, 0xd0), QColor(0xfb, 0xf5, 0xe6), QColor(0x55, 0x44, 0x33));
    const QPalette flat = paletteOf(Qt::white, Qt::white, Qt::black);
    const QPalette black = paletteOf(Qt::black, Qt::black, Qt::white);
    const QPalette faint = paletteOf(QColor(0xee, 0xee, 0xee), Qt::white, QColor(0xaa, 0xaa, 0xaa));
    const Look usual;
    const Look yellow{.accent = QColor(0xf5, 0xd0, 0x20)};
    const Look navy{.accent = QColor(0x10, 0x10, 0x60)};
    const Look high{.contrast = Contrast::High};
    return {{"Light", light, usual},        {"Dark", darkPalette(), usual},
            {"Sand", sand, usual},          {"Flat", flat, usual},
            {"Black", black, usual},        {"FaintText", faint, usual},
            {"LightYellow", light, yellow}, {"DarkYellow", darkPalette(), yellow},
            {"LightNavy", light, navy},     {"DarkNavy", darkPalette(), navy},
            {"LightHigh", light, high},     {"DarkHigh", darkPalette(), high},
            {"BlackHigh", black, high}};
}

class Colors : public testing::TestWithParam<Case> {
  protected:
    [[nodiscard]] std::vector<QColor> grounds() const {
        return {colors_.page, colors_.card, colors_.hover, colors_.pressed, colors_.notice};
    }

    [[nodiscard]] bool isHigh() const { return GetParam().look.contrast == Contrast::High; }

    const PaneColors colors_ = PaneColors::of(GetParam().palette, GetParam().look);
};

TEST_P(Colors, textCanBeReadInEveryState) {
    for (const QColor& ground : grounds()) {
        for (const QColor& color : {colors_.text, colors_.secondary, colors_.tint}) {
            EXPECT_GE(contrast(color, ground), isHigh() ? 7 : 4.5)
                << color.name().toStdString() << " on " << ground.name().toStdString();
        }
    }
}

TEST_P(Colors, marksAreSeenInEveryState) {
    for (const QColor& ground : grounds()) {
        EXPECT_GE(contrast(colors_.mark, ground), isHigh() ? 4.5 : 3);
    }
}

TEST_P(Colors, knobIsSeenOnItsTrack) {
    for (const QColor& track : {colors_.tint, colors_.mark}) {
        EXPECT_GE(contrast(colors_.knobOn(track), track), 3);
    }
}

TEST_P(Colors, cardsHaveAnEdge) {
    EXPECT_GE(contrast(colors_.edge, colors_.page), isHigh() ? 4.5 : 1.2);
    EXPECT_GE(contrast(colors_.edge, colors_.card), isHigh() ? 4.5 : 1.2);
}

TEST_P(Colors, statesOfARowAreTold) {
    EXPECT_NE(colors_.hover, colors_.card);
    EXPECT_NE(colors_.pressed, colors_.card);
    EXPECT_NE(colors_.pressed, colors_.hover);
}

INSTANTIATE_TEST_SUITE_P(Look, Colors, testing::ValuesIn(cases()),
                         [](const testing::TestParamInfo<Case>& tried) {
                             return tried.param.name;
                         });

/// How a row of the chooser for the limit looks, in pixels: the ground in its middle, and of what
/// is painted on it whatever differs most.
struct Pixels {
    QColor ground;
    double strongest = 1;
};

Pixels pixelsOf(const QImage& picture, const QRect& place) {
    Pixels pixels{picture.pixelColor(place.center())};
    for (int y = place.top(); y <= place.bottom(); ++y) {
        for (int x = place.left(); x <= place.right(); ++x) {
            pixels.strongest =
                std::max(pixels.strongest, contrast(picture.pixelColor(x, y), pixels.ground));
        }
    }
    return pixels;
}

class PixelContrast : public testing::TestWithParam<bool> {
  protected:
    PixelContrast() {
        if (GetParam()) {
            window_.widget().setPalette(darkPalette());
        }
        window_.click(1);
    }

    [[nodiscard]] QRect rowPlace(NSInteger row) {
        return window_.view().onViewport(window_.view().layout().rowRect(row)).toRect();
    }

    QImage picture() {
        QCoreApplication::processEvents();
        return window_.view().viewport()->grab().toImage();
    }

    Window window_;
};

TEST_P(PixelContrast, checkmarkAndNameAreSeenOnTheCard) {
    const auto checked = window_.rows().indexOf(QRegularExpression(QStringLiteral("✓ .*")));
    const QRect row = rowPlace(checked);
    const QImage taken = picture();
    EXPECT_GE(pixelsOf(taken, row.adjusted(row.width() / 2, 2, -4, -2)).strongest, 4.5);
    EXPECT_GE(pixelsOf(taken, row.adjusted(4, 2, -row.width() / 2, -2)).strongest, 4.5);
}

TEST_P(PixelContrast, nameIsSeenUnderThePointer) {
    const QRect row = rowPlace(0);
    const QColor before = picture().pixelColor(row.center());
    QMouseEvent move(QEvent::MouseMove, QPointF(row.center()),
                     window_.view().viewport()->mapToGlobal(QPointF(row.center())), Qt::NoButton,
                     Qt::NoButton, Qt::NoModifier);
    QCoreApplication::sendEvent(window_.view().viewport(), &move);
    const QImage taken = picture();
    EXPECT_NE(taken.pixelColor(row.center()), before);
    EXPECT_GE(pixelsOf(taken, row.adjusted(4, 2, -row.width() / 2, -2)).strongest, 4.5);
}

TEST_P(PixelContrast, backButtonIsSeenUnderThePointer) {
    auto* back = window_.widget().findChild<QWidget*>(QStringLiteral("back"));
    back->setAttribute(Qt::WA_UnderMouse);
    const QImage taken = back->grab().toImage();
    Pixels pixels{taken.pixelColor(taken.width() / 2, 4)};
    const auto colors = PaneColors::of(window_.widget().palette(), window_.screen().look());
    EXPECT_EQ(pixels.ground, colors.hover);
    for (int x = 0; x < taken.width(); ++x) {
        for (int y = 0; y < taken.height(); ++y) {
            pixels.strongest =
                std::max(pixels.strongest, contrast(taken.pixelColor(x, y), pixels.ground));
        }
    }
    EXPECT_GE(pixels.strongest, 4.5);
}

INSTANTIATE_TEST_SUITE_P(Look, PixelContrast, testing::Bool(),
                         [](const auto& tried) { return tried.param ? "Dark" : "Light"; });

TEST(Look, accentThatChangesIsSeenAtOnce) {
    Window window;
    window.click(1);
    const QImage before = window.view().viewport()->grab().toImage();
    Look look = window.screen().look();
    look.accent = QColor(0xc0, 0x20, 0x20);
    window.screen().setLook(look);
    EXPECT_NE(window.view().viewport()->grab().toImage(), before);
}

} // namespace

} // namespace quorl::tests
