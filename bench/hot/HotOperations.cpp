// Does one of the pane's most frequent operations a number of times, for whoever counts what that
// takes (tools/phone-costs): nothing of it hangs on a clock, so that the figures of two runs are
// the same.
//
//     hot-operations               names the operations, a line each; behind a tab what to hold one
//                                  against, which is an operation too
//     hot-operations NAME COUNT

#include <algorithm>

#include "bench/hot/Operations.h"
#include "doubles/HostDouble.h"
#include "doubles/sessions/TaskDouble.h"
#include "doubles/virtual-time/VirtualTime.h"
#include "platform/SizeFormatter.h"
#include "quorl/adapters/LibraryPlaylist.h"
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
constexpr std::size_t manySongs = 10'000;
constexpr std::size_t manyPlaylists = 1'000;

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

    /// Those of the app: nobody takes notes.
    [[nodiscard]] LMSyncDefaults& syncDefaults() override { return *defaults_; }

    const std::shared_ptr<BusySession> session = create<BusySession>();

  private:
    const std::shared_ptr<quorl::SyncDefaults> defaults_ =
        std::make_shared<quorl::SyncDefaults>(preferences);
};

/// A music folder with many playlists, the first of which has many songs.
quorl::media::Inventory largeInventory() {
    quorl::media::Inventory inventory;
    inventory.playlists.resize(manyPlaylists);
    for (std::uint64_t id = 1; auto& playlist : inventory.playlists) {
        playlist.id = id++;
    }
    const auto directory = inventory.songs.addDirectory("");
    for (std::size_t song = 0; song < manySongs; ++song) {
        quorl::media::Song entry{};
        entry.size = 100'000;
        inventory.playlists.front().songs.push_back(inventory.songs.add(directory, entry));
    }
    return inventory;
}

/// What the app has of it.
class LargeLibrary {
  public:
    LargeLibrary() {
        for (const auto& playlist : inventory_->playlists) {
            playlists_.push_back(std::make_shared<quorl::LibraryPlaylist>(inventory_, playlist));
        }
        for (const auto property :
             {MPMediaPlaylistPropertyIsFolder, MPMediaPlaylistPropertyIsAugurMix,
              MPMediaPlaylistPropertyIsAugurPlaylist}) {
            isOrdinary_.push_back(MPMediaPropertyPredicate::predicateWithValue_forProperty(
                NSNumber::numberWithBool(false), property));
        }
    }

    [[nodiscard]] const auto& longPlaylist() const { return playlists_.front(); }

    /// What the chooser of playlists asks.
    [[nodiscard]] auto ordinary() const { return matching(playlists_, isOrdinary_); }

    [[nodiscard]] auto ordinaryInALoop() const {
        auto place = inventory_->playlists.begin();
        std::vector<std::shared_ptr<MPMediaPlaylist>> found;
        for (const auto& playlist : playlists_) {
            const auto& entry = *place++;
            if (!entry.folder && entry.generated == quorl::media::Generated::No) {
                found.push_back(playlist);
            }
        }
        return found;
    }

  private:
    std::shared_ptr<const quorl::media::Inventory> inventory_ =
        std::make_shared<const quorl::media::Inventory>(largeInventory());
    std::vector<std::shared_ptr<quorl::LibraryPlaylist>> playlists_;
    std::vector<std::shared_ptr<MPMediaPropertyPredicate>> isOrdinary_;
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

    void refreshLong() const {
        setAssetSyncPlaylist(LMSyncDefaults::sharedDefaults(), library_.longPlaylist());
        refresh();
    }

    void addUpSizes() const {
        std::uint64_t sum = 0;
        const auto items = library_.longPlaylist()->items();
        for (const auto& item : elements(items)) {
            const auto size = item->valueForProperty(MPMediaItemPropertyFileSize);
            sum += NSNumber::of(size.get())->unsignedLongLongValue();
        }
        keep(sum);
    }

    void findOrdinary() const { keep(library_.ordinary()); }

    void findOrdinaryInALoop() const { keep(library_.ordinaryInALoop()); }

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

    LargeLibrary library_;
    BusySession& session_;
    std::shared_ptr<LMQuorlSettingsController> root_ = create<LMQuorlSettingsController>();
    std::shared_ptr<LMQuorlPlaylistChooser> playlists_ = create<LMQuorlPlaylistChooser>();
    std::shared_ptr<LMQuorlLimitChooser> limits_ = create<LMQuorlLimitChooser>();
};

constexpr quorl::Operation<Panes> operations[]{
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
    {"rows and footer of 10,000 songs", &Panes::refreshLong, "the sizes of 10,000 songs"},
    {"the sizes of 10,000 songs", &Panes::addUpSizes},
    {"the ordinary ones of 1,000 playlists", &Panes::findOrdinary, "a loop over 1,000 playlists"},
    {"a loop over 1,000 playlists", &Panes::findOrdinaryInALoop},
};

} // namespace

int main(int count, char** words) {
    return quorl::perform<Panes>(operations, {words, static_cast<std::size_t>(count)}, [] {
        (void)quorl::mainQueueDescriptor(); // before any thread is started
        const auto host = busyHost();
        quorl::Host::install(host);
        return std::make_unique<Panes>(*host->session);
    });
}
