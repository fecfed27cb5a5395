#pragma once

#include "quorl/app/CompanionHost.h"
#include "quorl/app/Notices.h"
#include "quorl/app/PaneScreen.h"
#include "quorl/app/Places.h"
#include "quorl/process/MainQueueNotifier.h"
#include "runtime/lists/NavigationController.h"

namespace quorl {

class FrontPage;

/// The app apart from how it shows itself: its services, and the stack of panes with the root pane
/// in it. One per process, made before another thread is started. Main thread.
class Companion final : public QObject {
    Q_OBJECT

  public:
    /// Installs the host and makes the root pane. `screen` and `notices` outlive the companion.
    Companion(Places places, PaneScreen& screen, Notices& notices);

    /// Takes the panes off the screen, lets go of them and takes the host back.
    ~Companion() override;

    /// The panes; none where the plug-in has a problem.
    [[nodiscard]] NavigationController& navigation() { return *navigation_; }

    /// Why there is no pane, for the user; empty where there is one.
    [[nodiscard]] const std::string& problem() const { return problem_; }

    [[nodiscard]] Notices& notices() { return notices_; }

    [[nodiscard]] PaneScreen& screen() { return screen_; }

    /// Starts the sync engine of a trial, where this is one; that of the session starts by itself.
    void startTrialEngine() { host_->startTrialEngine(); }

    /// Who asks a person for a folder where one is needed.
    void setFolderChooser(CompanionHost::AskForFolder ask) {
        host_->setFolderChooser(std::move(ask));
    }

    /// Takes what another start of the app brings: a trial goes on with its places. Gives back a
    /// sentence for the person who started where that cannot be; empty where it is done.
    [[nodiscard]] std::string take(const Places& places);

    /// Brings the Music pane on the screen, over the front page, and begins to read the music
    /// folder. Throws `std::system_error` where the process may open no more files or start no more
    /// threads.
    void start();

    /// Of the playlist in a row of `pane`, which shows this name; nothing where the pane does not
    /// offer playlists, or the row is none.
    [[nodiscard]] std::optional<PlaylistFacts>
    factsOfRow(const UIViewController& pane, NSInteger paneRow, const std::string& name) const;

    /// The classes of the panes that are open over the front page, from below.
    [[nodiscard]] std::vector<std::string> openPanes() const;

    /// Leaves the panes over the front page for those of these classes, as far as there are rows
    /// that open them. After `start`.
    void reopen(const std::vector<std::string>& panes);

    /// Whether the services have given what they were asked for when the panes came on the screen.
    [[nodiscard]] bool hasAllAnswers() const { return host_->hasAllAnswers(); }

    /// Tells the panes, and whoever else listens, that the app leaves the screen, or comes back,
    /// and takes the top pane off the screen in between: what it shows then is how things stand.
    void enterBackground();
    void enterForeground();

    /// Whether the front page is seen beside the panes over it. Then there always is one: the Music
    /// pane where no other is open.
    void setFrontPlace(NavigationController::RootPlace place);

    /// Says whether a person sees the panes now: nothing is told on the desktop then. `told` is
    /// called some time later, once that counts; empty for nobody.
    void setSeen(bool isSeen, std::function<void()> told = {});

  Q_SIGNALS:
    /// The library has taken what is in the music folder now.
    void libraryRead();

    /// libdispatch's main queue has just been emptied.
    void idle();

    /// A choice could not be stored. It is still being made.
    void refused();

  private:
    void makeFrontPage();
    void refreshPages();
    void showChosen();
    void openMusicPane();
    void fillSecondPlace();

    const Places places_;
    PaneScreen& screen_;
    Notices& notices_;
    MainQueueNotifier mainQueue_;
    std::shared_ptr<CompanionHost> host_;
    std::shared_ptr<NavigationController> navigation_;
    std::shared_ptr<FrontPage> frontPage_; ///< null where the plug-in has a problem
    std::string problem_;
};

} // namespace quorl
