#include "tests/quorl/window/Window.h"

#include <QApplication>
#include <QTest>
#include <stdexcept>

#include "tests/quorl/StoredPreferences.h"

namespace quorl::tests {

namespace {

constexpr int patience = 60'000; // milliseconds

/// Chooses the folder, where one is given.
Places placesWith(const std::filesystem::path& music) {
    if (!music.empty()) {
        storePreference("music-folder", music.string());
    }
    return {};
}

} // namespace

Window::Window(const std::filesystem::path& music)
    : companion_(placesWith(music), screen_, notices_), window_(companion_, screen_) {
    Look still = screen_.look();
    still.motion = Motion::Reduced;
    screen_.setLook(still);
    window_.resize(360, 720);
    companion_.start();
    window_.show();
    if (!QTest::qWaitFor([this] { return companion_.hasAllAnswers() && window_.topView(); },
                         patience)) {
        throw std::runtime_error("the music folder is not read: " + companion_.problem());
    }
    notices_.set(Notices::Topic::Engine, ""); // that none runs
    QCoreApplication::processEvents();
}

std::string Window::title() { return view().content().pane().title().value_or(""); }

void Window::click(NSInteger row) {
    const auto place = view().onViewport(view().layout().rowRect(row)).center().toPoint();
    QTest::mouseClick(view().viewport(), Qt::LeftButton, Qt::NoModifier, place);
    QCoreApplication::processEvents();
}

void Window::press(Qt::Key key) {
    QTest::keyClick(&view(), key);
    QCoreApplication::processEvents();
}

void Window::pressWithFocus(Qt::Key key, Qt::KeyboardModifiers modifiers) {
    auto* focus = QApplication::focusWidget();
    QTest::keyClick(focus ? focus : &window_, key, modifiers);
    QCoreApplication::processEvents();
}

bool Window::waitForRow(const QString& text) {
    return waitForRow(QRegularExpression(QRegularExpression::escape(text)));
}

bool Window::waitForRow(const QRegularExpression& pattern) {
    const QRegularExpression whole(QRegularExpression::anchoredPattern(pattern.pattern()));
    return QTest::qWaitFor([this, &whole] { return rows().indexOf(whole) >= 0; }, patience);
}

QStringList Window::rows() {
    QStringList rows;
    for (NSInteger row = 0; row < view().content().rowCount(); ++row) {
        if (const auto cell = view().content().cell(row)) {
            const RowTexts texts = textsOf(*cell);
            rows << (texts.isChecked ? QStringLiteral("✓ ") : QString()) + texts.title +
                        (texts.value.isEmpty() ? QString() : QStringLiteral(": ") + texts.value);
        }
    }
    return rows;
}

} // namespace quorl::tests
