#include "quorl/app/Companion.h"

#include "quorl/app/PaneLoader.h"
#include "quorl/pages/FrontPage.h"
#include "runtime/plugins/PluginBundle.h"
#include "services/language/Translated.h"

namespace quorl {

using language::translated;

namespace {

/// The plug-in's class that lists what `offeredIn` gives, in that order.
constexpr std::string_view playlistChooser = "LMQuorlPlaylistChooser";

/// Null where `pane` has no such row.
std::shared_ptr<PSSpecifier> rowThatOpens(const std::string& name, UIViewController* pane) {
    auto* list = dynamic_cast<PSListController*>(pane);
    if (!list) {
        return nullptr;
    }
    for (const auto& row : elements<PSSpecifier>(list->specifiers())) {
        const auto& detail = row->detailControllerClass();
        if (detail && detail->name() == name) {
            return row;
        }
    }
    return nullptr;
}

/// What a pane calls itself; the name of its class where none can be made.
std::string titleOf(const Class& pane) {
    const auto made = std::dynamic_pointer_cast<QPSNotificationAppController>(pane.create());
    return made ? made->localizedPaneTitle() : pane.name();
}

} // namespace

Companion::Companion(Places places, PaneScreen& screen, Notices& notices)
    : places_(std::move(places)),
      screen_(screen),
      notices_(notices),
      host_(std::make_shared<CompanionHost>(places_, screen, notices)),
      navigation_(::create<NavigationController>()) {
    connect(&mainQueue_, &MainQueueNotifier::drained, this, &Companion::idle);
    connect(this, &Companion::refused, this, &Companion::showChosen, Qt::QueuedConnection);
    Host::install(host_);
    makeFrontPage();
}

Companion::~Companion() {
    host_->setEngineObserver({});
    host_->setRefusalObserver({});
    if (navigation_->isOnScreen()) {
        navigation_->disappear(false);
    }
    navigation_->clear();
    Host::install(nullptr);
}

void Companion::makeFrontPage() {
    const auto loaded = loadPane(pluginDirectories(places_.plugins));
    if (const auto* problem = std::get_if<PaneProblem>(&loaded)) {
        problem_ = problem->text;
        return;
    }
    const Class& pane = std::get<Class>(loaded);
    frontPage_ = FrontPage::over(*host_, pane, titleOf(pane));
    for (const LoadedPane& other : loadPanes(paneDirectories())) {
        if (const auto* problem = std::get_if<PaneProblem>(&other)) {
            frontPage_->addProblem(problem->text);
        } else {
            frontPage_->addPane(std::get<Class>(other), titleOf(std::get<Class>(other)));
        }
    }
    navigation_->setRootPane(frontPage_);
    (void)frontPage_->specifiers(); // builds the rows before the page is shown
    host_->setEngineObserver([this] { refreshPages(); });
    host_->setRefusalObserver([this] { Q_EMIT refused(); });
}

std::optional<PlaylistFacts> Companion::factsOfRow(const UIViewController& pane, NSInteger paneRow,
                                                   const std::string& name) const {
    const bool offersPlaylists = Class::ofObject(pane).name() == playlistChooser;
    return offersPlaylists && paneRow >= 0
               ? host_->factsOfRow(static_cast<std::size_t>(paneRow), name)
               : std::nullopt;
}

/// A page that is covered is refreshed when it comes back.
void Companion::refreshPages() {
    for (const auto& pane : navigation_->onScreen()) {
        if (auto* page = dynamic_cast<AppPage*>(pane.get())) {
            page->refresh();
        }
    }
}

/// A pane shows what was tapped at once. Where that could not be stored, it is to read what is.
void Companion::showChosen() {
    if (navigation_->isOnScreen()) {
        navigation_->disappear(false);
        navigation_->appear(false);
        screen_.scheduleDrawing();
    }
}

std::string Companion::take(const Places& places) {
    if (!places.plugins.empty() && places.plugins != places_.plugins) {
        return translated("quorl is running already, with other plug-ins. Close its window, then "
                          "start it again.");
    }
    if (places.purpose() == base::Purpose::Trial) {
        host_->takePlaces(places);
    }
    return {};
}

void Companion::start() {
    navigation_->appear(false);
    if (frontPage_) {
        openMusicPane();
    }
    screen_.scheduleDrawing();
    host_->openLibrary([this] { Q_EMIT libraryRead(); });
}

void Companion::openMusicPane() {
    if (!navigation_->open(frontPage_->paneRow())) {
        notices_.set(Notices::Topic::Pane,
                     translated("The pane cannot be shown. Install its plug-in again."));
    }
}

void Companion::setFrontPlace(NavigationController::RootPlace place) {
    navigation_->setRootPlace(place);
    fillSecondPlace();
}

/// Off the screen nothing is opened.
void Companion::fillSecondPlace() {
    const bool isBeside = navigation_->rootPlace() == NavigationController::RootPlace::Beside;
    if (isBeside && navigation_->isOnScreen() && navigation_->stack().size() == 1) {
        openMusicPane();
    }
}

std::vector<std::string> Companion::openPanes() const {
    std::vector<std::string> panes;
    const auto& stack = navigation_->stack();
    for (std::size_t at = 1; at < stack.size(); ++at) {
        panes.push_back(Class::ofObject(*stack[at]).name());
    }
    return panes;
}

void Companion::reopen(const std::vector<std::string>& panes) {
    while (navigation_->stack().size() > 1) {
        navigation_->pop(false);
    }
    for (const std::string& pane : panes) {
        const auto row = rowThatOpens(pane, navigation_->top().get());
        if (!row || !navigation_->open(row)) {
            break;
        }
    }
    fillSecondPlace();
    screen_.scheduleDrawing();
}

void Companion::enterBackground() {
    for (const auto& pane : navigation_->stack()) {
        if (auto* controller = dynamic_cast<PSController*>(pane.get())) {
            controller->willResignActive();
            controller->suspend();
        }
    }
    NSNotificationCenter::defaultCenter().postNotificationName_object(
        UIApplicationDidEnterBackgroundNotification, nullptr);
    navigation_->disappear(false);
}

void Companion::enterForeground() {
    host_->takePreferences(); // what others have just changed may not be announced yet
    NSNotificationCenter::defaultCenter().postNotificationName_object(
        UIApplicationWillEnterForegroundNotification, nullptr);
    for (const auto& pane : navigation_->stack()) {
        if (auto* controller = dynamic_cast<PSController*>(pane.get())) {
            controller->willBecomeActive();
        }
    }
    navigation_->appear(false);
    fillSecondPlace();
    screen_.scheduleDrawing();
}

void Companion::setSeen(bool isSeen, std::function<void()> told) {
    host_->setSeen(isSeen && navigation_->top(), std::move(told));
}

} // namespace quorl
