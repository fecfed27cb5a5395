// How the panes and pages look, each in its states, compared with what somebody has found right.

#include <QApplication>
#include <QCursor>
#include <QLocale>
#include <QPainter>
#include <QRegularExpression>
#include <filesystem>
#include <fstream>

#include <gmock/gmock.h>

#include "quorl/facts/EngineTrouble.h"
#include "quorl/pages/LeftOutPage.h"
#include "quorl/pages/RemovePage.h"
#include "quorl/pages/SyncPage.h"
#include "quorl/pages/WearablesPage.h"
#include "quorl/process/QtSetup.h"
#include "quorl/window/look/PaneColors.h"
#include "services/engine/Codes.h"
#include "services/engine/Message.h"
#include "services/engine/Names.h"
#include "services/language/Languages.h"
#include "services/wearable/Unseen.h"
#include "tests/quorl/StoredPreferences.h"
#include "tests/quorl/pages/MadeUpServices.h"
#include "tests/quorl/pictures/DrawnTexts.h"
#include "tests/quorl/pictures/EngineDouble.h"
#include "tests/quorl/pictures/PictureSheet.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

constexpr QSize phone(360, 640);

struct Variant {
    const char* name;
    const char* language = "en";
    QPalette (*palette)() = nullptr; ///< null: the light one
    Contrast contrast = Contrast::Standard;
    int scale = 1;
    int textPercent = 100;
};

void PrintTo(const Variant& variant, std::ostream* output) { *output << variant.name; }

/// On a wearable that is known to have 250 MB left, however much this machine has.
void fillWearable() {
    const auto directory =
        std::filesystem::path(qgetenv("XDG_DATA_HOME").constData()) / "quorl" / "wearable";
    std::filesystem::create_directories(directory);
    std::ofstream(directory / "other.bin").close();
    constexpr std::uintmax_t capacity = std::uintmax_t{4} << 30U;
    std::filesystem::resize_file(directory / "other.bin", capacity - 250'000'000);
}

engine::EngineState state() {
    engine::EngineState state;
    state.isThere = true;
    state.engine.playlistName = "Long Run";
    state.engine.statusCode = engine::code::upToDate;
    state.engine.syncState = engine::syncSynced;
    state.engine.lastComplete = 1'790'000'000'000'000;
    state.wearable = {.directory = "/media/walkman",
                      .name = "Velora",
                      .isConnected = true,
                      .isOnCharger = true,
                      .capacity = std::uint64_t{4} << 30U,
                      .available = 1'500'000'000,
                      .songs = 22'000'000,
                      .songCount = 3};
    return state;
}

/// With the second of three songs under way.
engine::EngineState syncing() {
    auto now = state();
    now.engine.statusCode = engine::code::syncing;
    now.engine.syncState = engine::syncSyncing;
    now.engine.beyondLimit = 12;
    now.engine.leftOut = {{"gone.mp3", "missing"}, {"notes/read me.txt", "not-music"}};
    now.engine.leftOutCount = 5;
    engine::SessionState session;
    session.path = std::string(engine::sessionsPath) + "/1";
    session.typeIdentifier = engine::deviceSyncType;
    session.currentItem = "Long/Two of Three.flac";
    session.isProgressValid = true;
    session.progress = engine::Fraction(0.42);
    session.bytes = 1'000'000'000;
    session.rate = 1'000'000;
    engine::TaskState task;
    task.path = session.path + "/1";
    task.session = sdbus::ObjectPath(session.path);
    task.groupingKey = engine::assetGroupingKey;
    task.isRunning = true;
    task.totalItemCount = 3;
    task.completedItemCount = 1;
    task.progress = engine::Fraction(0.42);
    session.tasks = {task};
    now.sessions = {session};
    return now;
}

engine::EngineState unplugged() {
    auto now = state();
    now.engine.statusCode = wearable::unseen::notPluggedIn;
    now.engine.syncState = engine::syncPending;
    now.wearable.isConnected = false;
    return now;
}

/// As a client words it.
engine::EngineState worded(engine::EngineState state) {
    state.engine.status = engine::sentence({state.engine.statusCode});
    return state;
}

WearableShelf shelf() {
    return {
        true,
        {halfFullStick(),
         {.name = "An old stick with a name that is longer than its row", .directory = "/media/b"},
         {.name = finding::embeddedName}},
        0,
        {},
        {"Camera"}};
}

class Pictures : public testing::TestWithParam<Variant> {
  protected:
    Pictures() {
        qputenv("TZ", "UTC");
        language::followLanguages({GetParam().language});
        QtSetup::followUsersLanguage();
        auto font = QFont(QStringLiteral("DejaVu Sans"));
        font.setPixelSize(15 * GetParam().textPercent / 100);
        QApplication::setFont(font);
        if (GetParam().palette) {
            QApplication::setPalette(GetParam().palette());
        }
        fillWearable();
        QCursor::setPos(2 * phone.width(), 2 * phone.height()); // out of the pictures
    }

    /// What the window shows once `engine` has been heard of and `open` has opened something in it.
    template <class Open>
    void add(const engine::EngineState& engine, Open open) {
        const EngineDouble engineOnTheBus(engine);
        Window window;
        Look look = window.screen().look();
        look.contrast = GetParam().contrast;
        window.screen().setLook(look);
        window.widget().resize(phone);
        open(window);
        for (int turn = 0; turn < 20; ++turn) {
            QCoreApplication::processEvents();
        }
        sheet_.add(pictureOf(window.widget()));
        texts_.append(drawnTexts(window.widget()));
    }

    /// A page over the Music pane, with made-up services.
    template <class Page>
    void addPage(const engine::EngineState& engine) {
        services_.state = worded(engine);
        services_.shelf = shelf();
        add(engine, [this](Window& window) {
            const auto page = create<Page>();
            page->setServices(services_);
            window.companion().navigation().pushController_animated(page, false);
        });
    }

    static QImage pictureOf(QWidget& widget) {
        const int scale = GetParam().scale;
        QImage picture(phone * scale, QImage::Format_RGB32);
        picture.setDevicePixelRatio(scale);
        widget.render(&picture);
        picture.setDevicePixelRatio(1);
        return picture;
    }

    void addAll();

    MadeUpServices services_;
    PictureSheet sheet_{GetParam().name, phone* GetParam().scale};
    QList<QList<DrawnText>> texts_; ///< of each picture
};

void Pictures::addAll() {
    const auto stay = [](Window&) {};
    const auto back = [](Window& window) { window.widget().goBack(); };
    add(state(), stay);
    add(syncing(), back);
    add(unplugged(), [](Window& window) {
        const auto trouble = troubleIn(worded(unplugged())).value();
        window.companion().notices().set(Notices::Topic::Engine,
                                         {trouble.sentence, nameOf(trouble.remedy), [] {}});
        window.widget().goBack();
    });
    storePreference("asset-sync-enabled", "true");
    addPage<SyncPage>(syncing());
    addPage<WearablesPage>(state());
    addPage<LeftOutPage>(syncing());
    addPage<RemovePage>(state());
    add(state(), [](Window& window) {
        window.click(0);
        window.click(0);
    });
    add(syncing(), [](Window& window) { window.click(0); });
    add(syncing(), [](Window& window) { window.click(1); });
}

TEST_P(Pictures, areAsSomebodyHasFoundThemRight) {
    addAll();
    EXPECT_EQ(sheet_.difference(), "");
}

QPalette flatBlack() {
    QPalette palette(Qt::black);
    palette.setColor(QPalette::Window, Qt::black);
    palette.setColor(QPalette::Base, Qt::black);
    palette.setColor(QPalette::WindowText, Qt::white);
    return palette;
}

INSTANTIATE_TEST_SUITE_P(All, Pictures,
                         testing::Values(Variant{.name = "light"},
                                         Variant{.name = "dark", .palette = darkPalette},
                                         Variant{.name = "high-contrast",
                                                 .palette = flatBlack,
                                                 .contrast = Contrast::High},
                                         Variant{.name = "twice-as-fine", .scale = 2},
                                         Variant{.name = "large-text", .textPercent = 200},
                                         Variant{.name = "right-to-left", .language = "ar"}),
                         [](const auto& tried) {
                             std::string name = tried.param.name;
                             std::erase(name, '-');
                             return name;
                         });

/// In a language whose texts have no plain letter, and a mark at each end.
class PseudoLanguage : public Pictures {};

/// All that was drawn, a line for each text or piece of one.
QStringList linesOf(const QList<QList<DrawnText>>& pictures) {
    QStringList lines;
    for (const auto& picture : pictures) {
        for (const auto& drawn : picture) {
            lines << drawn.text;
        }
    }
    return lines;
}

TEST_P(PseudoLanguage, isSpokenInAllTexts) {
    addAll();
    // Names of the devices, units, and what a person has given a name to.
    const QRegularExpression whatIsNoText(
        QStringLiteral("\\b(Velora|Zanthe|[MG]B|AM|PM|Camera|Walkman|An old stick with a name that "
                       "is long.*|Long Run|"
                       "Road Trip|Two of Three|gone\\.mp3|notes/read me\\.txt)"));
    const QRegularExpression plain(QStringLiteral("[A-Za-z]"));
    QStringList untranslated;
    for (auto line : linesOf(texts_)) {
        if (line.remove(whatIsNoText).contains(plain)) {
            untranslated << line;
        }
    }
    EXPECT_EQ(untranslated.join(u'\n').toStdString(), "");
}

TEST_P(PseudoLanguage, isWrittenToItsEnds) {
    addAll();
    const QRegularExpression withoutEnd(QStringLiteral("⟦[^⟦⟧]*(?=⟦|$)"));
    QStringList cut;
    for (const auto& picture : texts_) {
        auto all = withoutEnd.globalMatch(linesOf({picture}).join(u'\n'));
        while (all.hasNext()) {
            cut << all.next().captured();
        }
        for (const auto& drawn : picture) {
            if (drawn.left < 0 || drawn.right > phone.width()) {
                cut << drawn.text;
            }
        }
    }
    EXPECT_EQ(cut.join(u'\n').toStdString(), "");
}

INSTANTIATE_TEST_SUITE_P(All, PseudoLanguage,
                         testing::Values(Variant{.name = "pseudo-language", .language = "en_XA"}));

} // namespace

} // namespace quorl::tests
