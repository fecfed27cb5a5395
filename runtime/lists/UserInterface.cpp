#include "platform/UserInterface.h"

#include <cmath>

#include "runtime/host/Host.h"
#include "runtime/host/Screen.h"
#include "runtime/lists/Label.h"
#include "runtime/lists/TableView.h"

const NSNotificationName UIApplicationDidEnterBackgroundNotification =
    "UIApplicationDidEnterBackgroundNotification";
const NSNotificationName UIApplicationWillEnterForegroundNotification =
    "UIApplicationWillEnterForegroundNotification";

namespace {

quorl::Screen& screen() { return quorl::Host::required().screen(); }

class MainScreen final : public UIScreen {
  public:
    [[nodiscard]] CGFloat scale() const override { return screen().scale(); }
};

} // namespace

CGRect UIRectIntegralWithScale(const CGRect& rect, CGFloat scale) {
    // What is a whole pixel but for the error of the calculation that led to it is one.
    constexpr CGFloat tolerance = sizeof(CGFloat) == sizeof(double) ? 1e-6 : 1e-3F;
    const auto before = [scale](CGFloat edge) {
        return std::floor(edge * scale + tolerance) / scale;
    };
    const auto after = [scale](CGFloat edge) {
        return std::ceil(edge * scale - tolerance) / scale;
    };
    const CGFloat x = before(rect.x);
    const CGFloat y = before(rect.y);
    return {x, y, after(rect.x + rect.width) - x, after(rect.y + rect.height) - y};
}

UIScreen& UIScreen::mainScreen() {
    static auto* const mainScreen = new std::shared_ptr<UIScreen>(create<MainScreen>());
    return **mainScreen;
}

UITableViewCell::UITableViewCell() = default;

UITableViewCell::~UITableViewCell() = default;

bool UITableViewCell::init() {
    return initWithStyle_reuseIdentifier(UITableViewCellStyle::Default, {});
}

bool UITableViewCell::initWithStyle_reuseIdentifier(UITableViewCellStyle style,
                                                    std::string reuseIdentifier) {
    _style = style;
    _reuseIdentifier = std::move(reuseIdentifier);
    _textLabel = create<quorl::Label>();
    _detailTextLabel = create<quorl::Label>();
    return NSObject::init();
}

void UITableViewCell::setAccessoryType(UITableViewCellAccessoryType type) { _accessoryType = type; }

void UITableViewCell::setTintColor(std::optional<UIColor> color) { _tintColor = std::move(color); }

void UITableViewCell::layoutSubviews() { screen().layOutLabels(*this); }

void UIViewController::setTitle(std::optional<std::string> title) { _title = std::move(title); }

void UIViewController::viewWillAppear(bool animated) {
    if (auto* host = quorl::Host::current()) {
        host->screen().controllerWillAppear(*this, animated);
    }
}

void UIViewController::viewDidAppear(bool /*animated*/) {}

void UIViewController::viewWillDisappear(bool animated) {
    if (auto* host = quorl::Host::current()) {
        host->screen().controllerWillDisappear(*this, animated);
    }
}

void UIViewController::viewDidDisappear(bool /*animated*/) {}

UITableViewController::UITableViewController() = default;

UITableViewController::~UITableViewController() = default;

bool UITableViewController::init() { return initWithStyle(UITableViewStyle::Plain); }

bool UITableViewController::initWithStyle(UITableViewStyle style) {
    _style = style;
    _tableView = std::make_shared<quorl::TableView>(*this);
    return UIViewController::init() && quorl::Host::current() != nullptr;
}

void UITableViewController::viewWillAppear(bool animated) {
    UIViewController::viewWillAppear(animated);
    quorl::TableView::of(*this).setOnScreen(true);
}

void UITableViewController::viewDidDisappear(bool animated) {
    UIViewController::viewDidDisappear(animated);
    quorl::TableView::of(*this).setOnScreen(false);
}
