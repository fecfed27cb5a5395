// The same as hot-operations, on libdispatch's own main queue: what news of a sync take there.
//
//     hot-burst               names the operations, as hot-operations does
//     hot-burst NAME COUNT

#include "bench/hot/Operations.h"
#include "doubles/HostDouble.h"
#include "platform/Dispatch.h"
#include "runtime/objects/MainQueue.h"
#include "sync/LMQuorlSyncManager.h"

namespace {

constexpr int burst = 100;

/// Is told of the status, and does nothing about it.
class Listener final : public NSObject {
  public:
    void wasTold() { asm volatile("" : : "r"(this) : "memory"); }
};

class Listening {
  public:
    Listening() {
        NSNotificationCenter::defaultCenter().addObserver_selector_name_object(
            listener_.get(), NSNotificationSelector::of<&Listener::wasTold>("wasTold"),
            LMQuorlSyncStatusDidChangeNotification, manager_.get());
        quorl::drainMainQueue();
    }

    void tellOfATask() const {
        for (int news = 0; news < burst; ++news) {
            manager_->session_didUpdateSessionTask(session_, task_);
        }
        quorl::drainMainQueue();
    }

    void callDirectly() const {
        for (int news = 0; news < burst; ++news) {
            dispatch_async(dispatch_get_main_queue(),
                           [listener = listener_] { listener->wasTold(); });
        }
        quorl::drainMainQueue();
    }

  private:
    const std::shared_ptr<quorl::CallRecorder> nobody_ = std::make_shared<quorl::CallRecorder>();
    mutable quorl::SessionDouble session_{"session", nobody_};
    mutable quorl::TaskDouble task_{{}};
    const std::shared_ptr<LMQuorlSyncManager> manager_ = LMQuorlSyncManager::sharedManager();
    const std::shared_ptr<Listener> listener_ = create<Listener>();
};

constexpr quorl::Operation<Listening> operations[]{
    {"100 news of a task", &Listening::tellOfATask, "100 closures on the main queue"},
    {"100 closures on the main queue", &Listening::callDirectly},
};

} // namespace

int main(int count, char** words) {
    return quorl::perform<Listening>(operations, {words, static_cast<std::size_t>(count)}, [] {
        (void)quorl::mainQueueDescriptor(); // before any thread is started
        quorl::Host::install(std::make_shared<quorl::HostDouble>());
        return std::make_unique<Listening>();
    });
}
