#pragma once

#include <compare>
#include <type_traits>

#include "platform/Foundation.h"

/// The user-interface toolkit, as far as panes use it. Main thread only.

/// Points; double precision where pointers are 64 bits wide, single precision where they are 32.
using CGFloat = std::conditional_t<sizeof(void*) == 8, double, float>;

struct CGSize {
    CGFloat width = 0;
    CGFloat height = 0;

    [[nodiscard]] bool operator==(const CGSize&) const = default;
};

struct CGRect {
    CGFloat x = 0;
    CGFloat y = 0;
    CGFloat width = 0;
    CGFloat height = 0;

    [[nodiscard]] bool operator==(const CGRect&) const = default;
};

/// A colour: "#rrggbb", or a name that the host knows.
using UIColor = std::string;

/// `rect` with its edges moved outward to whole device pixels, `scale` pixels to the point, so that
/// what fits into `rect` still fits.
[[nodiscard]] CGRect UIRectIntegralWithScale(const CGRect& rect, CGFloat scale);

class UIScreen : public NSObject {
  public:
    /// The screen that the host shows its panes on.
    [[nodiscard]] static UIScreen& mainScreen();

    /// Device pixels to the point.
    [[nodiscard]] virtual CGFloat scale() const = 0;
};

/// One line of text. A text that is too wide for the frame is shown shortened.
class UILabel : public NSObject {
  public:
    /// Null where there is nothing to show.
    [[nodiscard]] virtual const std::optional<std::string>& text() const = 0;
    virtual void setText(std::optional<std::string> text) = 0;

    /// Null for the host's own colour.
    [[nodiscard]] virtual const std::optional<UIColor>& textColor() const = 0;
    virtual void setTextColor(std::optional<UIColor> color) = 0;

    /// In the coordinates of the view that holds the label.
    [[nodiscard]] virtual CGRect frame() const = 0;
    virtual void setFrame(const CGRect& frame) = 0;

    /// What the whole text needs, at the most `size`.
    [[nodiscard]] virtual CGSize sizeThatFits(const CGSize& size) const = 0;
};

/// The place of a row in a table.
struct NSIndexPath {
    NSInteger section = 0;
    NSInteger row = 0;

    [[nodiscard]] static constexpr NSIndexPath indexPathForRow_inSection(NSInteger row,
                                                                         NSInteger section) {
        return {section, row};
    }

    [[nodiscard]] auto operator<=>(const NSIndexPath&) const = default;
};

enum class UITableViewCellStyle : NSInteger {
    Default = 0,
    Value1 = 1, ///< title on the left, detail right-aligned on the right
    Value2 = 2,
    Subtitle = 3, ///< title above detail
};

enum class UITableViewCellAccessoryType : NSInteger {
    None = 0,
    DisclosureIndicator = 1,
    DetailDisclosureButton = 2,
    Checkmark = 3,
};

/// One row of a table on screen. Cells are made by a table's data source and used again for other
/// rows, with everything that was set on them.
class UITableViewCell : public NSObject {
  public:
    UITableViewCell();
    ~UITableViewCell() override;

    [[nodiscard]] bool init() override;
    [[nodiscard]] virtual bool initWithStyle_reuseIdentifier(UITableViewCellStyle style,
                                                             std::string reuseIdentifier);

    [[nodiscard]] UITableViewCellStyle style() const { return _style; }

    [[nodiscard]] const std::string& reuseIdentifier() const { return _reuseIdentifier; }

    /// The labels live as long as the cell.
    [[nodiscard]] UILabel& textLabel() const { return *_textLabel; }

    [[nodiscard]] UILabel& detailTextLabel() const { return *_detailTextLabel; }

    [[nodiscard]] UITableViewCellAccessoryType accessoryType() const { return _accessoryType; }

    void setAccessoryType(UITableViewCellAccessoryType type);

    /// The colour of the accessory; null for the host's own.
    [[nodiscard]] const std::optional<UIColor>& tintColor() const { return _tintColor; }

    void setTintColor(std::optional<UIColor> color);

    /// Places the labels. Called whenever the cell is laid out; this one gives the standard layout
    /// of the cell's style.
    virtual void layoutSubviews();

  private:
    UITableViewCellStyle _style = UITableViewCellStyle::Default;
    std::string _reuseIdentifier;
    std::shared_ptr<UILabel> _textLabel;
    std::shared_ptr<UILabel> _detailTextLabel;
    UITableViewCellAccessoryType _accessoryType = UITableViewCellAccessoryType::None;
    std::optional<UIColor> _tintColor;
};

enum class UITableViewStyle : NSInteger { Plain = 0, Grouped = 1 };

enum class UITableViewRowAnimation : NSInteger { Fade = 0 };

/// A scrolling list of rows in sections. It asks its data source for the rows that are on screen,
/// when they are drawn, and keeps no others.
class UITableView : public NSObject {
  public:
    /// A cell that went off screen and was made with this identifier, taken out of the table's
    /// store, or null where there is none.
    [[nodiscard]] virtual std::shared_ptr<UITableViewCell>
    dequeueReusableCellWithIdentifier(std::string_view identifier) = 0;

    /// The cell of a row on screen; null for any other row, and for every row between `reloadData`
    /// and the next drawing.
    [[nodiscard]] virtual std::shared_ptr<UITableViewCell>
    cellForRowAtIndexPath(const NSIndexPath& path) const = 0;

    /// Drops all rows; the next drawing asks the data source for everything again.
    virtual void reloadData() = 0;

    /// The next drawing asks the data source for these rows again.
    virtual void reloadRowsAtIndexPaths_withRowAnimation(const std::vector<NSIndexPath>& paths,
                                                         UITableViewRowAnimation animation) = 0;

    /// Takes the highlight off a tapped row, at once or fading.
    virtual void deselectRowAtIndexPath_animated(const NSIndexPath& path, bool animated) = 0;
};

/// A controller of one screen. The host calls the appearance methods in the order will, did; an
/// override passes the call to its base class.
class UIViewController : public NSObject {
  public:
    /// What the screen is called; null until it is set.
    [[nodiscard]] const std::optional<std::string>& title() const { return _title; }

    virtual void setTitle(std::optional<std::string> title);

    virtual void viewWillAppear(bool animated);
    virtual void viewDidAppear(bool animated);
    virtual void viewWillDisappear(bool animated);
    virtual void viewDidDisappear(bool animated);

  private:
    std::optional<std::string> _title;
};

/// A controller whose screen is one table, of which it is the data source and the delegate.
class UITableViewController : public UIViewController {
  public:
    UITableViewController();
    ~UITableViewController() override;

    /// As `initWithStyle` with the plain style.
    [[nodiscard]] bool init() override;

    /// False where no host is there to show the table.
    [[nodiscard]] virtual bool initWithStyle(UITableViewStyle style);

    [[nodiscard]] UITableViewStyle style() const { return _style; }

    /// The table, made with the controller. It lives as long as the controller.
    [[nodiscard]] UITableView& tableView() const { return *_tableView; }

    void viewWillAppear(bool animated) override;
    void viewDidDisappear(bool animated) override;

    /// Data source. Rows are asked for only in sections from 0 to below the number of sections.
    [[nodiscard]] virtual NSInteger numberOfSectionsInTableView(UITableView& tableView) = 0;
    [[nodiscard]] virtual NSInteger tableView_numberOfRowsInSection(UITableView& tableView,
                                                                    NSInteger section) = 0;
    [[nodiscard]] virtual std::shared_ptr<UITableViewCell>
    tableView_cellForRowAtIndexPath(UITableView& tableView, const NSIndexPath& path) = 0;

    /// Delegate: the user tapped a row.
    virtual void tableView_didSelectRowAtIndexPath(UITableView& tableView,
                                                   const NSIndexPath& path) = 0;

  private:
    UITableViewStyle _style = UITableViewStyle::Plain;
    std::shared_ptr<UITableView> _tableView;
};

/// Posted by the host on the main thread, with no object, when the app leaves the screen and before
/// it comes back to it.
extern const NSNotificationName UIApplicationDidEnterBackgroundNotification;
extern const NSNotificationName UIApplicationWillEnterForegroundNotification;
