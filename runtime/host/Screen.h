#pragma once

#include "platform/PreferencesList.h"

namespace quorl {

/// What the runtime needs of a host's window toolkit, and what it tells it. The methods whose name
/// says `will` are called before the thing happens; a host that draws takes them as a sign to draw
/// soon. Main thread only.
class Screen {
  public:
    Screen() = default;
    Screen(const Screen&) = delete;
    Screen& operator=(const Screen&) = delete;
    virtual ~Screen() = default;

    /// Device pixels to the point.
    [[nodiscard]] virtual CGFloat scale() const = 0;

    /// The colour of what can be tapped and of what is chosen.
    [[nodiscard]] virtual UIColor tintColor() const = 0;

    /// The text colour of lists, or null for the toolkit's own.
    [[nodiscard]] virtual std::optional<UIColor> listTextColor() const = 0;

    /// The width and height of a row, in points.
    [[nodiscard]] virtual CGSize rowSize() const = 0;

    /// What the text of a label needs, in points; an empty size for no text.
    [[nodiscard]] virtual CGSize sizeOfText(const UILabel& label) const = 0;

    /// Gives both labels of a cell their standard frames. Unless overridden: the standard layout of
    /// the cell's style within `rowSize`.
    virtual void layOutLabels(UITableViewCell& cell);

    virtual void labelDidSetFrame(UILabel& /*label*/) {}

    virtual void controllerWillAppear(UIViewController& /*controller*/, bool /*animated*/) {}

    virtual void controllerWillDisappear(UIViewController& /*controller*/, bool /*animated*/) {}

    virtual void specifierWillSetProperty(PSSpecifier& /*specifier*/,
                                          const std::optional<std::string>& /*value*/,
                                          std::string_view /*key*/) {}

    /// `specifier` may be null.
    virtual void listWillReloadSpecifier(PSListController& /*list*/,
                                         const PSSpecifier* /*specifier*/) {}

    virtual void listWillReload(PSListController& /*list*/) {}

    virtual void listWillShowController(PSListController& /*list*/, PSController* /*controller*/,
                                        std::optional<bool> /*animate*/) {}

    virtual void listWillHandleURL(PSListController& /*list*/, const std::string& /*url*/) {}

    virtual void tableWillReloadData(UITableView& /*table*/) {}

    virtual void tableWillReloadRows(UITableView& /*table*/,
                                     const std::vector<NSIndexPath>& /*paths*/,
                                     UITableViewRowAnimation /*animation*/) {}

    virtual void tableWillDeselectRow(UITableView& /*table*/, const NSIndexPath& /*path*/,
                                      bool /*animated*/) {}
};

} // namespace quorl
