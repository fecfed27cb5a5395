// Does one of the pane's most frequent operations a number of times, for whoever counts what that
// takes (tools/phone-costs): nothing of it hangs on a clock, so that the figures of two runs are
// the same.
//
//     hot-operations               names the operations, a line each
//     hot-operations NAME COUNT

#include <algorithm>
#include <charconv>
#include <iostream>
#include <span>

#include "doubles/HostDouble.h"
#include "doubles/sessions/TaskDouble.h"
#include "doubles/virtual-time/VirtualTime.h"
#include "platform/SizeFormatter.h"
#include "runtime/lists/TableView.h"
#include "runtime/objects/MainQueue.h"
#include "runtime/services/ObservedSession.h"
#include "settings/LMQuorlLimitChooser.h"
#include "settings/LMQuorlPlaylistChooser.h"
#include "settings/LMQuorlSettingsController.h"
#include "sync/LMQuorlSyncManager.h"
#include "sync/LMSyncDefaults+Extras.h"

namespace {

using quorl::HostDouble;
using quorl::SyncPreference;

constexpr std::uint64_t playlistCount = 100;
constexpr std::uint64_t chosen = playlistCount / 2;
constexpr std::size_t songCount = 100;
constexpr int taskCount = 100;
constexpr NSInteger rowsOnScreen = 10;

/// A session with songs under way. Its list is made once, so that what is counted is the pane's
/// work.
class BusySession final : public quorl::ObservedSession {
  public:
    [[nodiscard]] bool isFinished() const override { return false; }

    [[nodiscard]] NSArray<DVSessionTask> sessionTasks() const override { return tasks_; }

    [[nodiscard]] NSArray<DVSessionTask>
    sessionTasksWithGroupingKey(const std::string& /*key*/) const override {
        return tasks_;
    }

  private:
    static NSArray<DVSessionTask> someTasks() {
        std::vector<std::shared_ptr<DVSessionTask>> tasks;
        for (int task = 0; task < taskCount; ++task) {
            tasks.push_back(std::make_shared<quorl::TaskDouble>(
                quorl::TaskDescription{std::to_string(task),
                                       DVDeviceSyncSessionAssetTaskGroupingKey,
                                       {.isRunning = true, .total = 10, .progress = 0.5}}));
        }
        return std::make_shared<const std::vector<std::shared_ptr<DVSessionTask>>>(
            std::move(tasks));
    }

    NSArray<DVSessionTask> tasks_ = someTasks();
};

class BusyHost final : public HostDouble {
  public:
    [[nodiscard]] NSArray<DVSession> sessions(const std::string& /*type*/) override {
        return std::make_shared<const std::vector<std::shared_ptr<DVSession>>>(1, session);
    }

    const std::shared_ptr<BusySession> session = create<BusySession>();
};

/// A host with as much as a person has: a chosen playlist among others, a limit, a sync under way.
std::shared_ptr<BusyHost> busyHost() {
    auto host = std::make_shared<BusyHost>();
    for (std::uint64_t id = 1; id <= playlistCount; ++id) {
        host->mediaLibrary().addPlaylist(id, "Playlist")->setRevision(1);
    }
    host->mediaLibrary().playlist(chosen)->setSongSizes(quorl::SongSizes(songCount, 4'000'000));
    host->mediaLibrary().setMediaTypes(MPMediaTypeMusic);
    (void)host->preferences.setValue(SyncPreference::AssetSyncEnabled, 1);
    (void)host->preferences.setValue(SyncPreference::AssetSyncPlaylistPersistentID, chosen);
    (void)host->preferences.setValue(SyncPreference::AssetSyncLimitType, LMSyncLimitTypeStorage);
    (void)host->preferences.setValue(SyncPreference::AssetSyncLimit, 2048);
    host->wearable.setAnswer({.figures = quorl::UsageFigures{4e9, 1e9}});
    host->sizeTexts = HostDouble::SizeTexts::Platform;
    return host;
}

/// The panes, shown one over the other as a person opened them.
class Panes {
  public:
    explicit Panes(BusySession& session) : session_(session) {
        (void)LMQuorlSyncManager::sharedManager();
        quorl::VirtualTime::shared().drain();
        root_->viewWillAppear(false);
        quorl::VirtualTime::shared().drain();
        for (const std::shared_ptr<UITableViewController>& table :
             {std::shared_ptr<UITableViewController>(playlists_),
              std::shared_ptr<UITableViewController>(limits_)}) {
            quorl::TableView::of(*table).setRowsOnScreen(rowsOnScreen);
            table->viewWillAppear(false);
            quorl::TableView::of(*table).draw();
        }
    }

    void findPlaylist() const { keep(assetSyncPlaylist(LMSyncDefaults::sharedDefaults())); }

    void askForStage() const { keep(LMQuorlSyncManager::sharedManager()->syncStage()); }

    void askForProgress() const { keep(LMQuorlSyncManager::sharedManager()->progress()); }

    void askForCount() const { keep(LMQuorlSyncManager::sharedManager()->totalAssetCount()); }

    void tellOfATask() const {
        const auto task = elements(session_.sessionTasks()).front();
        session_.tellObservers([&](DVSessionObserver& observer) {
            observer.session_didUpdateSessionTask(session_, *task);
        });
        quorl::VirtualTime::shared().drain();
    }

    void refresh() const { root_->viewWillAppear(false); }

    void askForRow() const { keep(root_->limit(nullptr)); }

    void drawPlaylists() const {
        playlists_->tableView().reloadData();
        quorl::TableView::of(*playlists_).draw();
    }

    void chooseAmount() const {
        limits_->tableView_didSelectRowAtIndexPath(limits_->tableView(),
                                                   NSIndexPath::indexPathForRow_inSection(3, 1));
        quorl::VirtualTime::shared().drain();
    }

    void formatSize() const { keep(CPFSSizeStrings(123'456'789.0F)); }

  private:
    template <class Value>
    static void keep(const Value& value) {
        asm volatile("" : : "r"(&value) : "memory"); // as if somebody looked at it
    }

    BusySession& session_;
    std::shared_ptr<LMQuorlSettingsController> root_ = create<LMQuorlSettingsController>();
    std::shared_ptr<LMQuorlPlaylistChooser> playlists_ = create<LMQuorlPlaylistChooser>();
    std::shared_ptr<LMQuorlLimitChooser> limits_ = create<LMQuorlLimitChooser>();
};

struct Operation {
    std::string_view name;
    void (Panes::*perform)() const;
};

constexpr Operation operations[]{
    {"the synced playlist, remembered", &Panes::findPlaylist},
    {"the stage of 100 tasks", &Panes::askForStage},
    {"the progress of 100 tasks", &Panes::askForProgress},
    {"the count of 100 tasks", &Panes::askForCount},
    {"news of a task", &Panes::tellOfATask},
    {"rows and footer of 100 songs", &Panes::refresh},
    {"the row of the limit", &Panes::askForRow},
    {"ten rows of playlists", &Panes::drawPlaylists},
    {"a tap on an amount", &Panes::chooseAmount},
    {"the text of a size", &Panes::formatSize},
};

} // namespace

int main(int count, char** words) {
    const std::span arguments(words, static_cast<std::size_t>(count));
    if (arguments.size() != 3) {
        for (const Operation& operation : operations) {
            std::cout << operation.name << '\n';
        }
        return 0;
    }
    const auto* const found =
        std::ranges::find(operations, std::string_view(arguments[1]), &Operation::name);
    const std::string_view digits = arguments[2];
    int turns = 0;
    const auto read = std::from_chars(digits.data(), digits.data() + digits.size(), turns);
    if (found == std::end(operations) || read.ptr != digits.data() + digits.size()) {
        std::cerr << "hot-operations: give the name of an operation and a number\n";
        return 2;
    }
    (void)quorl::mainQueueDescriptor(); // before any thread is started
    const auto host = busyHost();
    quorl::Host::install(host);
    const Panes panes(*host->session);
    for (int turn = 0; turn < turns; ++turn) {
        (panes.*found->perform)();
    }
    return 0;
}
