#include "quorl/pages/FrontPage.h"

#include <QDateTime>
#include <QLocale>

#include "quorl/facts/SizeWords.h"
#include "quorl/pages/SyncPage.h"
#include "quorl/pages/WearablesPage.h"
#include "services/language/Translated.h"

namespace quorl {

using language::translated;

namespace {

std::string timeText(std::uint64_t microseconds) {
    const auto time = QDateTime::fromMSecsSinceEpoch(static_cast<qint64>(microseconds / 1000));
    return QLocale().toString(time, QLocale::ShortFormat).toStdString();
}

std::string storageOf(const engine::WearableStatus& wearable) {
    return wearable.capacity == 0 ? translated("Unknown")
                                  : freeSpaceWords(wearable.available, wearable.capacity);
}

std::string connectionOf(const engine::WearableStatus& wearable) {
    return wearable.isEmbedded    ? translated("On this device (for trying out)")
           : wearable.isConnected ? translated("Connected")
                                  : translated("Not connected");
}

/// Nothing but the engine's own sentence, so that there is one truth.
std::string statusOf(const engine::EngineState& state) {
    return state.isThere ? state.engine.status
                         : translated("The sync engine is not running, so nothing is synced. Start "
                                      "quorl-syncd, or log in again.");
}

std::shared_ptr<PSSpecifier> rowOf(const Class& pane, const std::string& name) {
    return PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
        name, nullptr, std::nullopt, std::nullopt, pane, PSCellType::LinkList, std::nullopt);
}

} // namespace

std::shared_ptr<FrontPage> FrontPage::over(PageServices& services, const Class& pane,
                                           const std::string& paneName) {
    auto page = ::create<FrontPage>();
    if (!page) {
        return nullptr;
    }
    page->setServices(services);
    page->setTitle("Velora");
    page->paneRow_ = rowOf(pane, paneName);
    return page;
}

void FrontPage::addPane(const Class& pane, const std::string& name) {
    otherRows_.push_back(rowOf(pane, name));
}

void FrontPage::addProblem(const std::string& text) {
    otherRows_.push_back(group(std::nullopt, text));
}

AppPage::Rows FrontPage::rows() {
    Rows rows{group(std::nullopt, statusOf(state()))};
    if (state().isThere) {
        addWearable(rows);
    }
    rows.push_back(paneRow_);
    rows.insert(rows.end(), otherRows_.begin(), otherRows_.end());
    return rows;
}

void FrontPage::addWearable(Rows& rows) {
    const auto& wearable = state().wearable;
    const auto& engine = state().engine;
    rows.push_back(value(translated("Connection"), connectionOf(wearable)));
    rows.push_back(chargerRow());
    rows.push_back(value(translated("Storage"), storageOf(wearable)));
    rows.push_back(value(translated("Last Complete Sync"), engine.lastComplete == 0
                                                               ? translated("Not yet")
                                                               : timeText(engine.lastComplete)));
    rows.push_back(group(std::nullopt, {}));
    rows.push_back(link(translated("Wearable"), "", Class::of<WearablesPage>()));
    rows.push_back(link(translated("Sync"), SyncPage::summaryOf(state()), Class::of<SyncPage>()));
}

/// That of the embedded wearable is a pretence.
AppPage::Row FrontPage::chargerRow() {
    const auto& wearable = state().wearable;
    if (!wearable.isEmbedded) {
        return value(translated("Charger"), wearable.isOnCharger
                                                ? translated("On its charger")
                                                : translated("Not on its charger"));
    }
    return toggle(translated("Simulated Charger"), wearable.isOnCharger,
                  PSSetter::of<&FrontPage::setOnCharger>("setOnCharger::"));
}

void FrontPage::setOnCharger(const std::shared_ptr<NSObject>& isOn, const Row& /*row*/) {
    const auto* number = NSNumber::of(isOn.get());
    services().setOnCharger(number && number->boolValue());
}

} // namespace quorl
