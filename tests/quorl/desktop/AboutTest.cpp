#include <QAccessible>
#include <QFile>
#include <QMenu>
#include <QTest>
#include <QTextBrowser>
#include <QToolButton>
#include <filesystem>
#include <fstream>

#include <gmock/gmock.h>

#include "quorl/window/desktop/AboutWindow.h"
#include "quorl/window/desktop/Licences.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

namespace {

using testing::HasSubstr;

constexpr int patience = 60'000; // milliseconds

AboutWindow* aboutOf(Window& window) { return window.widget().findChild<AboutWindow*>(); }

/// Gives this session the manual page, and a reader of manuals that notes what it is to show.
class Reader {
  public:
    Reader() {
        const std::filesystem::path data = qgetenv("XDG_DATA_HOME").toStdString();
        write(data / "applications/reader.desktop",
              "[Desktop Entry]\nType=Application\nName=Reader\nMimeType=x-scheme-handler/man;\n"
              "Exec=sh -c \"echo \\\\$0 >" +
                  data.string() + "/shown.part; mv " + data.string() + "/shown.part " + shown_ +
                  "\" %u\n");
        write(std::filesystem::path(qgetenv("XDG_CONFIG_HOME").toStdString()) / "mimeapps.list",
              "[Default Applications]\nx-scheme-handler/man=reader.desktop\n");
        write(data / "man/man1/quorl.1", ".TH QUORL 1\n");
    }

    /// What it was asked to show, as soon as it was.
    [[nodiscard]] std::string waitForPage() const {
        (void)QTest::qWaitFor([this] { return std::filesystem::exists(shown_); }, patience);
        std::string page;
        std::getline(std::ifstream(shown_) >> std::ws, page);
        return page;
    }

  private:
    static void write(const std::filesystem::path& path, const std::string& text) {
        std::filesystem::create_directories(path.parent_path());
        std::ofstream(path) << text;
    }

    const std::string shown_ = qgetenv("XDG_DATA_HOME").toStdString() + "/shown";
};

TEST(Help, isTheManualWhereItCanBeRead) {
    const Reader reader;
    Window window;
    window.pressWithFocus(Qt::Key_F1);
    EXPECT_EQ(reader.waitForPage(), "man:quorl(1)");
    EXPECT_FALSE(aboutOf(window));
}

TEST(Help, isWhatTheAppIsWhereNoManualCanBeRead) {
    Window window;
    window.pressWithFocus(Qt::Key_F1);
    ASSERT_TRUE(aboutOf(window));
    EXPECT_TRUE(aboutOf(window)->isVisible());
}

TEST(About, tellsVersionAndLicences) {
    Window window;
    AboutWindow about(&window.widget());
    const auto text = about.findChild<QTextBrowser*>()->toPlainText().toStdString();
    EXPECT_THAT(text, HasSubstr("Version " + QCoreApplication::applicationVersion().toStdString()));
    EXPECT_THAT(text, HasSubstr("Its licence is Apache-2.0."));
    for (const Licence& licence : licences()) {
        EXPECT_THAT(text, HasSubstr(std::string(licence.work) + ": " + licence.identifier));
    }
}

TEST(About, namesEachLibraryThatTheAppHas) {
    std::ifstream drawing(SOURCE_DIRECTORY "/ARCHITECTURE.md");
    std::vector<std::string> named;
    for (std::string line;
         std::getline(drawing, line) && line != "## Dependencies, and why each is there";) {
    }
    for (std::string line; std::getline(drawing, line);) {
        if (line.starts_with("| ") && !line.starts_with("| library") &&
            line.find("(build)") == std::string::npos &&
            line.find("(tests)") == std::string::npos &&
            line.find("(benchmarks)") == std::string::npos) {
            named.push_back(line.substr(2, line.find_first_of(" /,|", 2) - 2));
        }
    }
    EXPECT_GT(named.size(), 5U);
    for (const std::string& library : named) {
        EXPECT_TRUE(std::ranges::any_of(licences(), [&library](const Licence& licence) {
            return std::string(licence.work).starts_with(library);
        })) << library;
    }
}

TEST(About, isReachedByTheMenuOfTheFrontPageWithKeysAlone) {
    Window window;
    auto* button = window.widget().findChild<QToolButton*>(QStringLiteral("menu"));
    EXPECT_FALSE(button->isVisible());
    window.pressWithFocus(Qt::Key_Escape);
    ASSERT_TRUE(button->isVisible());
    EXPECT_TRUE(button->focusPolicy() & Qt::TabFocus);
    EXPECT_EQ(QAccessible::queryAccessibleInterface(button)->text(QAccessible::Name), "Menu");
    button->setFocus(Qt::TabFocusReason);
    QTimer::singleShot(0, button->menu(), [menu = button->menu()] {
        QTest::keyClick(menu, Qt::Key_Down);
        QTest::keyClick(menu, Qt::Key_Down);
        QTest::keyClick(menu, Qt::Key_Return);
    });
    QTest::keyClick(button, Qt::Key_Space); // returns when the menu is closed
    ASSERT_TRUE(QTest::qWaitFor([&window] { return aboutOf(window) != nullptr; }, patience));
    EXPECT_TRUE(aboutOf(window)->isVisible());
}

TEST(About, isOneWindowHoweverOftenItIsAskedFor) {
    Window window;
    window.pressWithFocus(Qt::Key_F1);
    const auto* first = aboutOf(window);
    QTest::keyClick(&window.view(), Qt::Key_F1);
    EXPECT_EQ(window.widget().findChildren<AboutWindow*>().size(), 1);
    QTest::keyClick(aboutOf(window), Qt::Key_Escape);
    EXPECT_TRUE(first);
    EXPECT_TRUE(QTest::qWaitFor([&window] { return aboutOf(window) == nullptr; }, patience));
}

} // namespace

} // namespace quorl::tests
