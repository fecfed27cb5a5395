#pragma once

#include <QWidget>

#include "quorl/app/Companion.h"
#include "quorl/window/ForegroundWatch.h"
#include "quorl/window/HeaderBar.h"
#include "quorl/window/PageColumns.h"
#include "quorl/window/PageSlide.h"
#include "quorl/window/rows/RowsView.h"

namespace quorl {

/// The window: a header, notices, and the top pane of the companion's stack, with the front page
/// beside it where there is room. Main thread.
class MainWindow final : public QWidget {
    Q_OBJECT

  public:
    /// Both outlive the window.
    MainWindow(Companion& companion, WindowScreen& screen);

    /// Makes the header the window's title bar. Before the window is shown.
    void takeFrame();

    /// The view of the top pane; null where the plug-in has a problem.
    [[nodiscard]] RowsView* topView() const;

    /// Comes to the front of all windows, as far as the desktop lets it. `token` is what the
    /// desktop gave for that; empty for nothing.
    void comeForward(const QByteArray& token);

    /// The view of the front page, which may be the top pane; null as above.
    [[nodiscard]] RowsView* frontView() const;

    /// Leaves the top pane, where there is one below it that is not seen beside it.
    void goBack();

    bool eventFilter(QObject* watched, QEvent* event) override;

  protected:
    void resizeEvent(QResizeEvent* event) override;
    bool event(QEvent* event) override;

  private:
    void addShortcuts();
    void askForFolder(const std::filesystem::path& start,
                      const std::function<void(const std::filesystem::path&)>& chosen);
    void showContext(const RowsView& view, NSInteger row, QPoint onScreen);
    void addMenu();
    void showGuide();
    void showAbout();

    void closeWindow() { close(); }

    void escape();
    void search();
    void draw();
    void showTopPane();
    [[nodiscard]] bool showsStack() const;
    void takeViewsOfStack();
    void takeColumns();
    void switchColumn();
    [[nodiscard]] RowsView* viewWithFocus() const;
    [[nodiscard]] bool canGoBack() const;
    void showTitles();

    Companion& companion_;
    WindowScreen& screen_;
    HeaderBar* header_;
    PageColumns* pages_;
    PageSlide* slide_;
    std::vector<RowsView*> views_; ///< of the panes of the stack, in its order; owned by `pages_`
    ForegroundWatch foreground_;
};

} // namespace quorl
