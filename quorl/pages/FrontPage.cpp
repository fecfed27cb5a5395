#include "quorl/pages/FrontPage.h"

#include <QDateTime>
#include <QLocale>

#include "platform/SizeFormatter.h"

namespace quorl {

namespace {

std::shared_ptr<PSSpecifier> makeGroup(std::optional<std::string> title) {
    return PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
        std::move(title), nullptr, std::nullopt, std::nullopt, std::nullopt, PSCellType::Group,
        std::nullopt);
}

std::shared_ptr<PSSpecifier>
makeValueRow(std::string title, const std::shared_ptr<NSObject>& target, PSGetter getter) {
    return PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
        std::move(title), target, std::nullopt, getter, std::nullopt, PSCellType::TitleValue,
        std::nullopt);
}

std::string timeText(std::uint64_t microseconds) {
    const auto time = QDateTime::fromMSecsSinceEpoch(static_cast<qint64>(microseconds / 1000));
    return QLocale().toString(time, QLocale::ShortFormat).toStdString();
}

std::string sizeText(std::uint64_t bytes) { return CPFSSizeStrings(static_cast<float>(bytes)); }

/// What the engine is about, and what its last session came to, as one paragraph.
std::string statusText(const engine::EngineState& state) {
    if (!state.isThere) {
        return "The sync engine is not running, so nothing is synced. Start quorl-syncd, or log in "
               "again.";
    }
    std::string text = state.engine.status;
    if (!state.engine.lastMessage.empty() && state.engine.lastMessage != text) {
        text += (text.empty() ? "" : " ") + state.engine.lastMessage;
    }
    return text;
}

} // namespace

std::shared_ptr<FrontPage> FrontPage::over(EngineLink& engine, const Class& pane,
                                           const std::string& paneName, bool isEmbedded) {
    auto page = ::create<FrontPage>();
    if (!page) {
        return nullptr;
    }
    page->engine_ = &engine;
    page->isEmbedded_ = isEmbedded;
    page->setTitle("Velora");
    page->paneRow_ = PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
        paneName, nullptr, std::nullopt, std::nullopt, pane, PSCellType::LinkList, std::nullopt);
    return page;
}

NSArray<PSSpecifier> FrontPage::specifiers() {
    if (_specifiers) {
        return _specifiers;
    }
    const auto self = strong(this);
    wearableGroup_ = makeGroup(std::nullopt);
    rows_ = {makeValueRow("Connection", self, PSGetter::of<&FrontPage::connection>("connection:")),
             isEmbedded_
                 ? PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
                       "On Charger", self, PSSetter::of<&FrontPage::setOnCharger>("setOnCharger::"),
                       PSGetter::of<&FrontPage::isOnCharger>("isOnCharger:"), std::nullopt,
                       PSCellType::Switch, std::nullopt)
                 : makeValueRow("Charger", self, PSGetter::of<&FrontPage::charger>("charger:")),
             makeValueRow("Storage", self, PSGetter::of<&FrontPage::storage>("storage:")),
             makeValueRow("Last Sync", self, PSGetter::of<&FrontPage::lastSync>("lastSync:"))};
    auto list = std::make_shared<std::vector<std::shared_ptr<PSSpecifier>>>();
    list->push_back(wearableGroup_);
    list->insert(list->end(), rows_.begin(), rows_.end());
    list->push_back(makeGroup(std::nullopt));
    list->push_back(paneRow_);
    _specifiers = list;
    return _specifiers;
}

void FrontPage::viewWillAppear(bool animated) {
    PSListController::viewWillAppear(animated);
    refresh();
}

void FrontPage::refresh() {
    if (!_specifiers) {
        return;
    }
    for (const auto& row : rows_) {
        reloadSpecifier(row);
    }
    const auto text = statusText(engine_->state());
    if (wearableGroup_->propertyForKey(PSFooterTextGroupKey) != text) {
        wearableGroup_->setProperty_forKey(text, PSFooterTextGroupKey);
        reload();
    }
}

std::optional<std::string> FrontPage::connection(const std::shared_ptr<PSSpecifier>& /*row*/) {
    return engine_->state().wearable.isConnected ? "Connected" : "Not connected";
}

std::optional<std::string> FrontPage::charger(const std::shared_ptr<PSSpecifier>& /*row*/) {
    return engine_->state().wearable.isOnCharger ? "On its charger" : "Not on its charger";
}

std::optional<std::string> FrontPage::isOnCharger(const std::shared_ptr<PSSpecifier>& /*row*/) {
    return std::string(engine_->state().wearable.isOnCharger ? PSSwitchOnValue : PSSwitchOffValue);
}

std::optional<std::string> FrontPage::storage(const std::shared_ptr<PSSpecifier>& /*row*/) {
    const auto& wearable = engine_->state().wearable;
    return wearable.capacity == 0
               ? "Unknown"
               : sizeText(wearable.available) + " of " + sizeText(wearable.capacity) + " free";
}

std::optional<std::string> FrontPage::lastSync(const std::shared_ptr<PSSpecifier>& /*row*/) {
    const auto& engine = engine_->state().engine;
    return engine.lastTime == 0 ? "Not yet" : timeText(engine.lastTime);
}

void FrontPage::setOnCharger(const std::shared_ptr<NSObject>& value,
                             const std::shared_ptr<PSSpecifier>& /*row*/) {
    const auto* number = dynamic_cast<const NSNumber*>(value.get());
    engine_->setOnCharger(number && number->boolValue());
}

} // namespace quorl
