#include "quorl/reports/Screenshot.h"

#include <QApplication>
#include <QCursor>
#include <QImageWriter>
#include <QPixmap>
#include <iostream>

#include "quorl/process/QtSetup.h"
#include "quorl/window/MainWindow.h"
#include "services/language/Translated.h"

namespace quorl {

namespace {

/// Takes the picture, then ends the application's event loop, with an exit code.
class Photographer final : public QObject {
  public:
    /// All outlive the photographer.
    Photographer(const Picture& picture, Companion& companion, MainWindow& window)
        : picture_(picture), companion_(companion), window_(window) {
        connect(&companion, &Companion::idle, this, &Photographer::beginWhenAnswered);
    }

  private:
    void beginWhenAnswered() {
        if (companion_.hasAllAnswers()) {
            disconnect(&companion_, &Companion::idle, this, nullptr);
            // The picture is of a pane, whether an engine happens to run or not.
            companion_.notices().set(Notices::Topic::Engine, "");
            companion_.screen().whenDrawn(*this, [this] { openPane(); });
        }
    }

    void openPane() {
        RowsView* view = window_.topView();
        if (picture_.pane == Picture::Pane::Front) {
            window_.goBack();
        } else if (view && picture_.pane != Picture::Pane::Root) {
            view->tap(picture_.pane == Picture::Pane::Playlist ? 0 : 1);
        }
        companion_.screen().whenDrawn(*this, [this] { take(); });
    }

    void take() {
        QImageWriter writer(QString::fromStdString(picture_.file.string()), "png");
        if (writer.write(window_.grab().toImage())) {
            QCoreApplication::exit(static_cast<int>(ExitCode::Success));
            return;
        }
        std::cerr << "quorl: "
                  << language::filled(language::translated(
                                          "The picture could not be written to {file}: {reason}. "
                                          "Choose another file, or make room for it."),
                                      {{"file", picture_.file.string()},
                                       {"reason", writer.errorString().toStdString()}})
                  << '\n';
        QCoreApplication::exit(static_cast<int>(ExitCode::Failure));
    }

    const Picture& picture_;
    Companion& companion_;
    MainWindow& window_;
};

void choosePlatform(const Picture& picture) {
    if (!QtSetup::hasDisplay()) {
        qputenv("QT_QPA_PLATFORM", "offscreen");
    }
    qputenv("QT_SCALE_FACTOR", QByteArray::number(picture.scale));
}

void chooseLook(const Picture& picture) {
    if (QGuiApplication::platformName() == QStringLiteral("offscreen")) {
        QCursor::setPos(picture.width, picture.height); // nobody's pointer, out of the picture
    }
    if (picture.isDark) {
        QApplication::setPalette(darkPalette());
    }
}

} // namespace

ExitCode takeScreenshot(char* program, const Places& places, const Picture& picture) {
    choosePlatform(picture);
    QtSetup setup(program);
    const QApplication application(setup.argumentCount(), setup.arguments());
    QtSetup::followUsersLanguage();
    chooseLook(picture);
    WindowScreen screen;
    Look still = screen.look();
    still.motion = Motion::Reduced;
    screen.setLook(still);
    Notices notices;
    Companion companion(places, screen, notices);
    MainWindow window(companion, screen);
    window.resize(picture.width, picture.height);
    const Photographer photographer(picture, companion, window);
    companion.start();
    window.show();
    return static_cast<ExitCode>(QApplication::exec());
}

} // namespace quorl
