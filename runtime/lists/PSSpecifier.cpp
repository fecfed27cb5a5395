#include "platform/PreferencesList.h"
#include "runtime/host/Host.h"
#include "runtime/host/Screen.h"

const std::string_view PSSwitchOnValue = "on";
const std::string_view PSSwitchOffValue = "off";
const std::string_view PSFooterTextGroupKey = "PSFooterTextGroupKey";

std::shared_ptr<PSSpecifier> PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
    std::optional<std::string> name, const std::shared_ptr<NSObject>& target,
    std::optional<PSSetter> set, std::optional<PSGetter> get, std::optional<Class> detail,
    PSCellType cell, std::optional<Class> edit) {
    auto specifier = create<PSSpecifier>();
    specifier->_name = std::move(name);
    specifier->_target = target;
    specifier->_set = set;
    specifier->_get = get;
    specifier->_detail = detail;
    specifier->_cell = cell;
    specifier->_edit = edit;
    return specifier;
}

std::optional<std::string> PSSpecifier::value() {
    const auto target = _target.lock();
    return target && _get ? (*_get)(*target, strong(this)) : std::nullopt;
}

void PSSpecifier::setValue(const std::shared_ptr<NSObject>& value) {
    if (const auto target = _target.lock(); target && _set) {
        (*_set)(*target, value, strong(this));
    }
}

void PSSpecifier::setProperty_forKey(std::optional<std::string> value, std::string_view key) {
    if (auto* host = quorl::Host::current()) {
        host->screen().specifierWillSetProperty(*this, value, key);
    }
    if (value) {
        _properties.insert_or_assign(std::string(key), std::move(*value));
    } else if (const auto found = _properties.find(key); found != _properties.end()) {
        _properties.erase(found);
    }
}

std::optional<std::string> PSSpecifier::propertyForKey(std::string_view key) const {
    const auto found = _properties.find(key);
    return found == _properties.end() ? std::nullopt : std::optional(found->second);
}
