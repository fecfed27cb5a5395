#pragma once

#include "platform/PreferencesList.h"

namespace quorl {

/// The stack of panes, from the root pane up, as every host shows it. It owns the panes.
class NavigationController : public PSRootController {
  public:
    /// Puts the root pane in. The stack is empty before.
    void setRootPane(const std::shared_ptr<PSController>& pane);

    /// From the root pane to the top one.
    [[nodiscard]] const std::vector<std::shared_ptr<UIViewController>>& stack() const {
        return stack_;
    }

    /// The top pane; null for an empty stack.
    [[nodiscard]] std::shared_ptr<UIViewController> top() const;

    /// Where the root pane is while there are panes above it.
    enum class RootPlace {
        Below,  ///< They cover it.
        Beside, ///< It stays on the screen, beside the top pane.
    };

    /// Tells the root pane where it comes on the screen by that, or leaves it; nothing while the
    /// stack is off the screen. `Below` at first.
    void setRootPlace(RootPlace place);

    [[nodiscard]] RootPlace rootPlace() const { return rootPlace_; }

    /// The panes that are seen when the stack is on the screen, the root pane first.
    [[nodiscard]] std::vector<std::shared_ptr<UIViewController>> onScreen() const;

    /// The whole stack comes on the screen, or leaves it: tells the panes that are seen.
    void appear(bool animated);
    void disappear(bool animated);

    /// What of the two came last.
    [[nodiscard]] bool isOnScreen() const { return isOnScreen_; }

    /// A tap on a row: opens the row's detail pane. False where the row has none, or where it could
    /// not be made.
    bool open(const std::shared_ptr<PSSpecifier>& specifier);

    void pushController_animated(const std::shared_ptr<PSController>& controller,
                                 bool animated) override;

    /// Leaves the top pane and lets go of it; the root pane stays.
    void pop(bool animated);

    /// Leaves the panes above one of the stack, the top one first.
    void returnTo(const UIViewController& pane);

    /// The pane right above one of the stack; null for none.
    [[nodiscard]] std::shared_ptr<UIViewController> above(const UIViewController& pane) const;

    /// Lets go of every pane, the top one first.
    void clear();

    /// Hands the URL to the top pane; false for an empty stack.
    bool openURL(const std::string& url) override;

  private:
    [[nodiscard]] bool isAlwaysSeen(const UIViewController& pane) const;

    std::vector<std::shared_ptr<UIViewController>> stack_;
    RootPlace rootPlace_ = RootPlace::Below;
    bool isOnScreen_ = false;
};

/// Draws whatever of a pane is marked for drawing: its list or its table.
void draw(UIViewController& pane);

} // namespace quorl
