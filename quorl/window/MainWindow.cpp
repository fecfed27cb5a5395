#include "quorl/window/MainWindow.h"

#include <QAccessibleWidget>
#include <QApplication>
#include <QDesktopServices>
#include <QFile>
#include <QFileDialog>
#include <QGuiApplication>
#include <QMenu>
#include <QMouseEvent>
#include <QShortcut>
#include <QUrl>
#include <QVBoxLayout>
#include <algorithm>

#include "quorl/window/NoticeBar.h"
#include "quorl/window/ProblemPage.h"
#include "quorl/window/desktop/AboutWindow.h"
#include "quorl/window/desktop/Guide.h"
#include "quorl/window/frame/WindowFrame.h"

namespace quorl {

namespace {

QString titleOf(const UIViewController& pane) {
    return QString::fromStdString(pane.title().value_or(""));
}

bool shows(const RowsView* view, const std::shared_ptr<UIViewController>& pane) {
    return &view->content().pane() == pane.get();
}

/// Screen readers follow only what is a window by its role; a plain widget is none.
QAccessibleInterface* readAsWindow(const QString& /*className*/, QObject* object) {
    auto* window = qobject_cast<MainWindow*>(object);
    return window ? new QAccessibleWidget(window, QAccessible::Window) : nullptr;
}

} // namespace

MainWindow::MainWindow(Companion& companion, WindowScreen& screen)
    : companion_(companion),
      screen_(screen),
      header_(new HeaderBar(screen, this)),
      pages_(new PageColumns(screen, this)),
      slide_(new PageSlide(pages_)),
      foreground_(*this, companion) {
    QAccessible::installFactory(readAsWindow); // more than once does no harm
    setFont(screen.font());
    auto* column = new QVBoxLayout(this);
    column->setContentsMargins(0, 0, 0, 0);
    column->setSpacing(0);
    column->addWidget(header_);
    column->addWidget(new NoticeBar(companion.notices(), screen, this));
    column->addWidget(pages_, 1);
    addShortcuts();
    companion.setFolderChooser(
        [this](const auto& start, const auto& chosen) { askForFolder(start, chosen); });
    addMenu();
    connect(&screen, &PaneScreen::drawing, this, &MainWindow::draw);
    connect(pages_, &PageColumns::countChanged, this, &MainWindow::takeColumns);
    if (!companion.problem().empty()) {
        auto* page = new ProblemPage(QString::fromStdString(companion.problem()), pages_);
        pages_->add(page);
        pages_->showPages(nullptr, page);
        setWindowTitle(tr("Music"));
        header_->setTitles(windowTitle(), QString(), HeaderBar::Search::None);
    }
    draw();
}

void MainWindow::takeFrame() { frameByHeader(*this, *header_, screen_); }

void MainWindow::addShortcuts() {
    connect(header_, &HeaderBar::backClicked, this, &MainWindow::goBack);
    connect(header_, &HeaderBar::searchClicked, this, &MainWindow::search);
    const auto add = [this](const QKeySequence& keys, void (MainWindow::*action)()) {
        connect(new QShortcut(keys, this), &QShortcut::activated, this, action);
    };
    add(Qt::Key_Escape, &MainWindow::escape);
    add(Qt::Key_Back, &MainWindow::escape);
    add(Qt::ALT | Qt::Key_Left, &MainWindow::goBack);
    add(Qt::Key_Backspace, &MainWindow::goBack);
    add(QKeySequence::Find, &MainWindow::search);
    add(Qt::Key_F1, &MainWindow::showGuide);
    add(Qt::Key_F6, &MainWindow::switchColumn);
    add(Qt::CTRL | Qt::Key_Q, &MainWindow::closeWindow);
    add(Qt::CTRL | Qt::Key_W, &MainWindow::closeWindow);
    QCoreApplication::instance()->installEventFilter(this); // the button of a mouse that goes back
}

void MainWindow::addMenu() {
    auto* menu = new QMenu(this);
    menu->addAction(tr("Help"), this, &MainWindow::showGuide);
    menu->addAction(tr("About Velora"), this, &MainWindow::showAbout);
    menu->addAction(tr("Close"), this, &MainWindow::closeWindow);
    header_->setMenu(menu);
}

bool MainWindow::eventFilter(QObject* watched, QEvent* event) {
    const bool isPress =
        event->type() == QEvent::MouseButtonPress || event->type() == QEvent::MouseButtonDblClick;
    const auto* widget = isPress ? qobject_cast<QWidget*>(watched) : nullptr;
    if (!widget || widget->window() != this ||
        static_cast<QMouseEvent*>(event)->button() != Qt::BackButton) {
        return QWidget::eventFilter(watched, event);
    }
    goBack();
    return true;
}

void MainWindow::showGuide() {
    if (!openGuide()) {
        showAbout();
    }
}

void MainWindow::showAbout() {
    auto* about = findChild<AboutWindow*>();
    if (!about) {
        about = new AboutWindow(this);
    }
    about->show();
    about->activateWindow();
}

/// Does not wait for the answer.
void MainWindow::askForFolder(const std::filesystem::path& start,
                              const std::function<void(const std::filesystem::path&)>& chosen) {
    auto* dialog = new QFileDialog(this, tr("Choose a Folder"), QFile::decodeName(start.c_str()));
    dialog->setAttribute(Qt::WA_DeleteOnClose);
    dialog->setFileMode(QFileDialog::Directory);
    dialog->setOption(QFileDialog::ShowDirsOnly);
    connect(dialog, &QFileDialog::fileSelected, this,
            [chosen](const QString& folder) { chosen(QFile::encodeName(folder).toStdString()); });
    dialog->open();
}

/// What there is to know of a playlist, and the way to its file.
void MainWindow::showContext(const RowsView& view, NSInteger row, QPoint onScreen) {
    auto& content = view.content();
    const auto name = content.cell(row)->textLabel().text().value_or("");
    const auto facts = companion_.factsOfRow(content.pane(), content.paneRow(row), name);
    if (!facts) {
        return;
    }
    auto* menu = new QMenu(this);
    menu->setAttribute(Qt::WA_DeleteOnClose);
    menu->setAccessibleName(QString::fromStdString(name));
    for (const auto& fact : {facts->contents, facts->fit}) {
        if (!fact.empty()) {
            menu->addAction(QString::fromStdString(fact))->setEnabled(false);
        }
    }
    const auto folder = QFile::decodeName(facts->file.parent_path().c_str());
    menu->addAction(QFile::decodeName(facts->file.filename().c_str()))->setEnabled(false);
    connect(menu->addAction(tr("Open Its Folder")), &QAction::triggered, this,
            [folder] { QDesktopServices::openUrl(QUrl::fromLocalFile(folder)); });
    menu->popup(onScreen);
}

void MainWindow::escape() {
    if (auto* view = viewWithFocus(); view && view->isSearched()) {
        view->closeSearch();
    } else {
        goBack();
    }
}

void MainWindow::search() {
    if (auto* view = viewWithFocus()) {
        view->openSearch();
    }
}

void MainWindow::resizeEvent(QResizeEvent* event) {
    QWidget::resizeEvent(event);
    screen_.scheduleDrawing(); // the title depends on whether all rows are seen
}

bool MainWindow::event(QEvent* event) {
    if (event->type() == QEvent::ApplicationFontChange) { // never comes to `changeEvent`
        screen_.setFont(QApplication::font());
        setFont(screen_.font());
        screen_.scheduleDrawing();
    }
    return QWidget::event(event);
}

RowsView* MainWindow::topView() const { return views_.empty() ? nullptr : views_.back(); }

RowsView* MainWindow::frontView() const { return views_.empty() ? nullptr : views_.front(); }

void MainWindow::comeForward(const QByteArray& token) {
    // The only way to hand a token to Qt.
    if (!token.isEmpty() && QGuiApplication::platformName() == QStringLiteral("wayland")) {
        qputenv("XDG_ACTIVATION_TOKEN", token);
    }
    setWindowState(windowState() & ~Qt::WindowMinimized);
    show();
    raise();
    activateWindow();
}

bool MainWindow::canGoBack() const {
    return companion_.navigation().stack().size() > (pages_->hasTwo() ? 2U : 1U);
}

void MainWindow::goBack() {
    if (canGoBack()) {
        companion_.navigation().pop(true);
        screen_.scheduleDrawing();
    }
}

void MainWindow::takeColumns() {
    using RootPlace = NavigationController::RootPlace;
    companion_.setFrontPlace(pages_->hasTwo() ? RootPlace::Beside : RootPlace::Below);
    screen_.scheduleDrawing();
}

void MainWindow::switchColumn() {
    if (pages_->hasTwo() && topView()) {
        auto* other = viewWithFocus() == topView() ? frontView() : topView();
        other->setFocus(Qt::OtherFocusReason);
    }
}

/// The top one where neither has.
RowsView* MainWindow::viewWithFocus() const {
    const bool isInFront = frontView() && frontView()->isVisible() &&
                           frontView()->isAncestorOf(QApplication::focusWidget());
    return isInFront ? frontView() : topView();
}

void MainWindow::draw() {
    showTopPane();
    for (RowsView* view : views_) {
        view->setOpenRow(pages_->hasTwo() ? RowsView::OpenRow::Marked : RowsView::OpenRow::Plain);
        view->draw();
    }
    showTitles();
}

/// Makes the views those of the stack, and shows the last one.
void MainWindow::showTopPane() {
    if (showsStack()) {
        return;
    }
    const auto depth = views_.size();
    const bool moves = isVisible() && depth > 0 && screen_.look().motion == Motion::Full;
    const QPixmap before = moves ? pages_->grab(pages_->placeOfTop()) : QPixmap();
    takeViewsOfStack();
    if (!topView()) {
        return;
    }
    pages_->showPages(frontView(), topView());
    topView()->setFocus(Qt::OtherFocusReason);
    if (moves) {
        topView()->draw();
        // One pane in place of another is a step forward, too.
        slide_->begin(pages_->placeOfTop(), before, pages_->grab(pages_->placeOfTop()),
                      views_.size() < depth ? PageSlide::Direction::Back
                                            : PageSlide::Direction::Forward,
                      screen_.look().motion);
    }
}

bool MainWindow::showsStack() const {
    return std::ranges::equal(views_, companion_.navigation().stack(), shows);
}

void MainWindow::takeViewsOfStack() {
    const auto& stack = companion_.navigation().stack();
    const auto kept =
        std::mismatch(views_.begin(), views_.end(), stack.begin(), stack.end(), shows);
    for (auto left = kept.first; left != views_.end(); ++left) {
        delete *left;
    }
    views_.erase(kept.first, views_.end());
    for (auto pane = kept.second; pane != stack.end(); ++pane) {
        auto* view = new RowsView(PaneContent::of(*pane, companion_.navigation()), screen_, pages_);
        view->setAccessibleName(titleOf(**pane));
        connect(view, &RowsView::contextAsked, this,
                [this, view](NSInteger row, QPoint place) { showContext(*view, row, place); });
        pages_->add(view);
        views_.push_back(view);
    }
}

void MainWindow::showTitles() {
    const auto& stack = companion_.navigation().stack();
    if (stack.empty()) {
        return;
    }
    setWindowTitle(titleOf(*stack.front()));
    const bool isLong = topView() && topView()->canBeSearched();
    header_->setTitles(titleOf(*stack.back()),
                       canGoBack() ? titleOf(**(stack.end() - 2)) : QString(),
                       isLong ? HeaderBar::Search::Offered : HeaderBar::Search::None);
}

} // namespace quorl
