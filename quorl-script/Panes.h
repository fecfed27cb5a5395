#pragma once

#include "doubles/ScreenDouble.h"
#include "quorl-script/Trace.h"
#include "runtime/lists/NavigationController.h"

namespace quorl {

/// The panes that the host of a script holds, and the finger on them. Each method does what its
/// command says, or throws a `CommandError` and does nothing. Main thread.
class Panes {
  public:
    /// `screen` outlives this object.
    Panes(ScreenDouble& screen, std::shared_ptr<Trace> trace);

    /// From the root pane to the top one.
    [[nodiscard]] const std::vector<std::shared_ptr<UIViewController>>& stack() const {
        return navigation_->stack();
    }

    /// The controller above the stack.
    [[nodiscard]] NavigationController& navigation() { return *navigation_; }

    /// The top pane.
    [[nodiscard]] UIViewController& top() const;

    /// The top pane, which is a table.
    [[nodiscard]] UITableViewController& topTable() const;

    /// Makes the root pane; the host lets go of the one before, and of what is on it.
    void createRoot(const Class& rootClass);

    void askForSpecifiers();
    void appear(bool animated);
    void disappear(bool animated);
    void tapSpecifier(const std::string& title);
    void tapRow(const NSIndexPath& path);
    void back();
    void scrollTo(NSInteger row);
    void releaseAll();

    /// Draws what needs drawing. Nothing of that is traced.
    void draw();

  private:
    [[nodiscard]] PSListController& root() const;
    [[nodiscard]] std::shared_ptr<PSSpecifier> rowOnScreen(const std::string& title) const;

    ScreenDouble& screen_;
    std::shared_ptr<Trace> trace_;
    std::shared_ptr<NavigationController> navigation_;
    bool isOnScreen_ = false;
};

} // namespace quorl
