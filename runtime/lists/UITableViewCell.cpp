#include "runtime/host/Host.h"
#include "runtime/host/Screen.h"
#include "runtime/lists/Label.h"

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

void UITableViewCell::layoutSubviews() { quorl::Host::required().screen().layOutLabels(*this); }
