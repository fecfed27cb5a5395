#include "quorl/window/MainWindow.h"

#include <QShortcut>
#include <QVBoxLayout>

#include "quorl/window/NoticeBar.h"
#include "quorl/window/ProblemPage.h"

namespace quorl {

namespace {

QString titleOf(const UIViewController& pane) {
    return QString::fromStdString(pane.title().value_or(""));
}

QColor tintOf(const Screen& screen) { return QString::fromStdString(screen.tintColor()); }

} // namespace

MainWindow::MainWindow(Companion& companion, WindowScreen& screen)
    : companion_(companion),
      screen_(screen),
      header_(new HeaderBar(tintOf(screen), this)),
      pages_(new QStackedWidget(this)),
      foreground_(*this, companion) {
    setFont(screen.font());
    const QColor tint = tintOf(screen);
    auto* column = new QVBoxLayout(this);
    column->setContentsMargins(0, 0, 0, 0);
    column->setSpacing(0);
    column->addWidget(header_);
    column->addWidget(new NoticeBar(companion.notices(), tint, this));
    column->addWidget(pages_, 1);
    addShortcuts();
    connect(&screen, &PaneScreen::drawing, this, &MainWindow::draw);
    if (!companion.problem().empty()) {
        pages_->addWidget(new ProblemPage(QString::fromStdString(companion.problem()), pages_));
        setWindowTitle(tr("Music"));
        header_->setTitles(windowTitle(), QString());
    }
    draw();
}

void MainWindow::addShortcuts() {
    connect(header_, &HeaderBar::backClicked, this, &MainWindow::goBack);
    for (const QKeySequence& keys :
         {QKeySequence(Qt::Key_Escape), QKeySequence(Qt::ALT | Qt::Key_Left),
          QKeySequence(Qt::Key_Back)}) {
        connect(new QShortcut(keys, this), &QShortcut::activated, this, &MainWindow::goBack);
    }
}

RowsView* MainWindow::topView() const { return views_.empty() ? nullptr : views_.back(); }

void MainWindow::goBack() {
    companion_.navigation().pop(true);
    screen_.scheduleDrawing();
}

void MainWindow::draw() {
    showTopPane();
    for (RowsView* view : views_) {
        view->draw();
    }
    showTitles();
}

/// Makes the views those of the stack.
void MainWindow::showTopPane() {
    const auto& stack = companion_.navigation().stack();
    const auto shows = [](const RowsView* view, const std::shared_ptr<UIViewController>& pane) {
        return &view->content().pane() == pane.get();
    };
    const auto kept =
        std::mismatch(views_.begin(), views_.end(), stack.begin(), stack.end(), shows);
    for (auto left = kept.first; left != views_.end(); ++left) {
        delete *left;
    }
    views_.erase(kept.first, views_.end());
    for (auto pane = kept.second; pane != stack.end(); ++pane) {
        auto* view = new RowsView(PaneContent::of(*pane, companion_.navigation()), screen_, pages_);
        view->setAccessibleName(titleOf(**pane));
        pages_->addWidget(view);
        views_.push_back(view);
    }
    if (topView() && pages_->currentWidget() != topView()) {
        pages_->setCurrentWidget(topView());
        topView()->setFocus(Qt::OtherFocusReason);
    }
}

void MainWindow::showTitles() {
    const auto& stack = companion_.navigation().stack();
    if (stack.empty()) {
        return;
    }
    setWindowTitle(titleOf(*stack.front()));
    header_->setTitles(titleOf(*stack.back()),
                       stack.size() > 1 ? titleOf(**(stack.end() - 2)) : QString());
}

} // namespace quorl
