#pragma once

#include <QObject>
#include <QTimer>
#include <functional>

#include "runtime/host/Screen.h"

namespace quorl {

/// A screen that draws from Qt's event loop: however much changes in one turn of the loop, it is
/// drawn once, after that. Main thread.
class PaneScreen : public QObject, public Screen {
    Q_OBJECT

  public:
    /// The name by which panes and whoever paints them speak of the tint, which depends on what it
    /// is painted on.
    static constexpr const char* tintName = "tint";

    PaneScreen();

    /// Has `drawing` emitted soon.
    void scheduleDrawing();

    /// Has `next` called behind all that the main queue holds now and behind the drawing that this
    /// leads to; not at all where `waiting` is gone by then.
    void whenDrawn(QObject& waiting, std::function<void()> next);

    [[nodiscard]] UIColor tintColor() const override;
    [[nodiscard]] std::optional<UIColor> listTextColor() const override;

    void specifierWillSetProperty(PSSpecifier& specifier, const std::optional<std::string>& value,
                                  std::string_view key) override;
    void listWillReloadSpecifier(PSListController& list, const PSSpecifier* specifier) override;
    void listWillReload(PSListController& list) override;
    void listWillShowController(PSListController& list, PSController* controller,
                                std::optional<bool> animate) override;
    void tableWillReloadData(UITableView& table) override;
    void tableWillReloadRows(UITableView& table, const std::vector<NSIndexPath>& paths,
                             UITableViewRowAnimation animation) override;
    void tableWillDeselectRow(UITableView& table, const NSIndexPath& path, bool animated) override;

  Q_SIGNALS:
    /// The panes are to be drawn.
    void drawing();

    /// These rows still show what they showed; the next drawing takes them anew.
    void rowsWillFade(const UITableView& table, const std::vector<NSIndexPath>& paths);

    void rowWillBeDeselected(const UITableView& table, const NSIndexPath& path, bool animated);

  private:
    QTimer timer_;
};

} // namespace quorl
