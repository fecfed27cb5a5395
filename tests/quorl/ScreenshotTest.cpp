#include <QApplication>
#include <QImage>

#include <gmock/gmock.h>

#include "quorl/window/look/PaneColors.h"
#include "tests/quorl/QuorlProcess.h"
#include "tests/quorl/SampleMusic.h"
#include "tests/quorl/StoredPreferences.h"

namespace quorl::tests {

namespace {

using testing::HasSubstr;

class Screenshot : public testing::Test {
  protected:
    QImage take(std::vector<std::string> options, const Environment& environment = {}) {
        const auto file = (music_.folder() / "shot.png").string();
        options.insert(options.end(), {"--screenshot", file});
        QuorlProcess quorl(options, environment);
        EXPECT_EQ(quorl.end(), 0) << quorl.errors();
        return QImage(QString::fromStdString(file));
    }

    SampleMusic music_;
};

/// Where the picture has the tint, below `top`.
QRect tinted(const QImage& picture, int top = 0) {
    const QRgb tint = PaneColors::of(QApplication::palette(), Look()).tint.rgb();
    QRect found;
    for (int y = top; y < picture.height(); ++y) {
        for (int x = 0; x < picture.width(); ++x) {
            if (picture.pixel(x, y) == tint) {
                found |= QRect(x, y, 1, 1);
            }
        }
    }
    return found;
}

int headerHeight(int scale) { return 56 * scale; }

class Scale : public Screenshot, public testing::WithParamInterface<double> {};

TEST_P(Scale, pictureHasTheSizeInPixels) {
    const auto picture =
        take({"--scale", QByteArray::number(GetParam()).toStdString(), "--size", "400x600"});
    EXPECT_EQ(picture.size(),
              QSize(static_cast<int>(400 * GetParam()), static_cast<int>(600 * GetParam())));
}

INSTANTIATE_TEST_SUITE_P(Screenshot, Scale, testing::Values(1.0, 1.5, 2.0, 3.0));

TEST_F(Screenshot, isPhoneSizedUnlessAskedOtherwise) {
    EXPECT_EQ(take({}).size(), QSize(360, 720));
}

TEST_F(Screenshot, limitChooserHasTintedCheckmarksAtTheEndOfItsRows) {
    const auto picture = take({"--pane", "limit"});
    const QRect marks = tinted(picture, headerHeight(1));
    ASSERT_FALSE(marks.isEmpty());
    EXPECT_GT(marks.left(), 360 * 3 / 4);
}

TEST_F(Screenshot, rightToLeftLanguageMirrorsTheFinishedLayout) {
    const auto leftToRight = tinted(take({"--pane", "limit"}), headerHeight(1));
    const auto rightToLeft =
        tinted(take({"--pane", "limit"}, {{"LANGUAGE", "ar"}}), headerHeight(1));
    ASSERT_FALSE(rightToLeft.isEmpty());
    EXPECT_EQ(rightToLeft.width(), leftToRight.width());
    EXPECT_NEAR(rightToLeft.left(), 360 - leftToRight.right(), 2);
}

TEST_F(Screenshot, playlistChooserShowsTheChosenPlaylist) {
    storePreference("asset-sync-enabled", "false");
    const auto none = tinted(take({"--pane", "playlist"}), headerHeight(1));
    QuorlProcess quorl({"--text"});
    quorl.say("1");
    quorl.say("1");
    quorl.readUntil("✓ Long Run");
    ASSERT_EQ(quorl.end(), 0);
    const auto chosen = tinted(take({"--pane", "playlist"}), headerHeight(1));
    ASSERT_FALSE(chosen.isEmpty());
    EXPECT_LT(chosen.bottom(), none.top());
}

TEST_F(Screenshot, darkLookIsDark) {
    EXPECT_GT(qGray(take({}).pixel(4, 400)), 200);
    EXPECT_LT(qGray(take({"--dark"}).pixel(4, 400)), 60);
}

TEST_F(Screenshot, widestWindowKeepsTheCardsInTheMiddle) {
    const auto picture = take({"--size", "1600x700", "--pane", "limit"});
    EXPECT_LT(tinted(picture, headerHeight(1)).right(), 1600 - 230);
}

TEST_F(Screenshot, fileThatCannotBeWrittenIsNamed) {
    QuorlProcess quorl({"--screenshot", "/nonexistent/a.png"});
    EXPECT_EQ(quorl.end(), 1);
    EXPECT_THAT(quorl.errors(), HasSubstr("/nonexistent/a.png"));
}

TEST_F(Screenshot, missingMusicFolderIsPicturedWithANotice) {
    const auto file = (music_.folder() / "missing.png").string();
    QuorlProcess quorl({"--screenshot", file, "--music", "/nonexistent"});
    EXPECT_EQ(quorl.end(), 0);
    const QImage missing(QString::fromStdString(file));
    ASSERT_FALSE(missing.isNull());
    const int belowHeader = headerHeight(1) + 4;
    EXPECT_NE(missing.pixel(2, belowHeader), take({}).pixel(2, belowHeader));
}

} // namespace

} // namespace quorl::tests
