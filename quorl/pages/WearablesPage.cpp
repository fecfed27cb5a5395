#include "quorl/pages/WearablesPage.h"

#include "quorl/facts/SizeWords.h"
#include "services/base/Utf8.h"
#include "services/engine/RunningSession.h"
#include "services/language/Translated.h"

namespace quorl {

using language::filled;
using language::toTranslate;
using language::translated;

namespace {

/// The embedded one has as much room as the front page says.
std::string textOf(const finding::Offer& offer) {
    if (offer.isEmbedded()) {
        return {};
    }
    return offer.space ? freeSpaceWords(offer.space->available, offer.space->capacity)
                       : translated("Does not answer");
}

std::string nameOf(const finding::Offer& offer) {
    return offer.isEmbedded() ? translated(finding::embeddedName) : base::printable(offer.name);
}

/// Not a directory of it, which goes with it.
bool isEjectable(const finding::Offer& offer) {
    return offer.removal && offer.identity && offer.identity->mountPoint == offer.directory;
}

constexpr auto explanation = toTranslate(
    "Drives that are plugged in, and folders that music was synced to before. Music is only ever "
    "put on the one that is chosen; what else is on it stays as it is.");

} // namespace

bool WearablesPage::init() {
    setTitle(translated("Wearable"));
    return AppPage::init();
}

void WearablesPage::viewWillAppear(bool animated) {
    services().findWearables(PageServices::Finding::Wanted);
    AppPage::viewWillAppear(animated);
}

void WearablesPage::viewDidDisappear(bool animated) {
    AppPage::viewDidDisappear(animated);
    services().findWearables(PageServices::Finding::Over);
}

AppPage::Rows WearablesPage::rows() {
    const auto shelf = services().wearables();
    Rows rows{
        group(std::nullopt,
              translated(shelf.isComplete ? explanation : toTranslate("Looking for wearables…")))};
    addMissing(rows);
    addOffers(rows);
    if (services().canAskForFolder()) {
        rows.push_back(group(std::nullopt, {}));
        rows.push_back(button(translated("Other Directory…"),
                              PSSetter::of<&WearablesPage::chooseOther>("chooseOther::")));
    }
    addRemovals(rows);
    return rows;
}

void WearablesPage::addOffers(Rows& rows) {
    const auto shelf = services().wearables();
    for (std::size_t index = 0; index < shelf.offers.size(); ++index) {
        const auto& offer = shelf.offers[index];
        rows.push_back(about(offer.directory.string(),
                             choice(nameOf(offer), textOf(offer),
                                    shelf.chosen == index ? Chosen::Yes : Chosen::No,
                                    PSSetter::of<&WearablesPage::choose>("choose::"))));
    }
}

/// The chosen one is shown also where it is away.
void WearablesPage::addMissing(Rows& rows) {
    const auto missing = services().wearables().missing;
    if (!missing.empty()) {
        rows.push_back(
            choice(base::printable(missing),
                   translated(state().wearable.isConnected ? toTranslate("Connected")
                                                           : toTranslate("Not connected")),
                   Chosen::Yes, PSSetter::of<&WearablesPage::choose>("choose::")));
    }
}

/// A drive to which music is being synced stays where it is.
void WearablesPage::addRemovals(Rows& rows) {
    const auto shelf = services().wearables();
    for (const auto& name : shelf.safeToRemove) {
        rows.push_back(value(base::printable(name), translated("Safe to remove")));
    }
    for (const auto& offer : shelf.offers) {
        if (isEjectable(offer) && !engine::runningSession(state())) {
            rows.push_back(about(offer.directory.string(),
                                 button(filled(translated("Eject “{name}”"),
                                               {{"name", base::printable(offer.name)}}),
                                        PSSetter::of<&WearablesPage::eject>("eject::"))));
        }
    }
}

void WearablesPage::choose(const std::shared_ptr<NSObject>& /*nothing*/, const Row& row) {
    if (const auto directory = subjectOf(row)) {
        services().chooseWearable(*directory);
    }
}

void WearablesPage::eject(const std::shared_ptr<NSObject>& /*nothing*/, const Row& row) {
    services().ejectWearable(subjectOf(row).value_or(""));
}

void WearablesPage::chooseOther(const std::shared_ptr<NSObject>& /*nothing*/, const Row& /*row*/) {
    services().chooseOtherWearable();
}

} // namespace quorl
