// The least that a program of Qt does to show texts: what the companion app is held against.
//
//     plain-window TEXT...                  shows them, a label each, until it is ended
//     plain-window --picture FILE TEXT...   writes a picture of them and ends

#include <QApplication>
#include <QLabel>
#include <QPixmap>
#include <QTimer>
#include <QVBoxLayout>

int main(int count, char** words) {
    QApplication app(count, words);
    QStringList texts = QApplication::arguments().mid(1);
    const bool isPicture = texts.value(0) == QStringLiteral("--picture");
    const QString file = texts.value(1);
    if (isPicture) {
        texts = texts.mid(2);
    }

    QWidget window;
    auto* const layout = new QVBoxLayout(&window);
    for (const QString& text : texts) {
        layout->addWidget(new QLabel(text));
    }
    window.resize(360, 720);
    window.show();
    if (isPicture) {
        QTimer::singleShot(0, &window, [&window, &file] {
            QApplication::exit(window.grab().save(file, "png") ? 0 : 1);
        });
    }
    return QApplication::exec();
}
