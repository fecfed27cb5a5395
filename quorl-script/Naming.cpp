#include "quorl-script/Naming.h"

#include <typeinfo>
#include <unordered_map>

#include "platform/HostApp.h"
#include "platform/MediaLibrary.h"
#include "platform/SyncPreferences.h"
#include "platform/SyncSessions.h"
#include "quorl-script/StandInPane.h"

namespace quorl {

namespace {

class LifeWatch final : public NSObject {
  public:
    LifeWatch(std::string name, std::shared_ptr<Trace> trace)
        : name_(std::move(name)), trace_(std::move(trace)) {}

    ~LifeWatch() override { trace_->recordDealloc(name_); }

  private:
    std::string name_;
    std::shared_ptr<Trace> trace_;
};

constexpr char lifeWatchKey = 0; // its address is the key

template <class Platform>
bool is(const NSObject& object) {
    return dynamic_cast<const Platform*>(&object) != nullptr;
}

/// What an object's class is called, that of the platform for one of the host.
std::string platformName(const NSObject& object) {
    if (is<MPMediaLibrary>(object)) {
        return "MPMediaLibrary";
    }
    if (is<LMSyncDefaults>(object)) {
        return "LMSyncDefaults";
    }
    if (is<DVSession>(object)) {
        return "DVSession";
    }
    if (is<PSRootController>(object)) {
        return "PSRootController";
    }
    return Class::ofObject(object).name();
}

} // namespace

const std::string& className(const NSObject& object) {
    if (typeid(object) == typeid(StandInPane)) {
        return static_cast<const StandInPane&>(object).className();
    }
    thread_local std::unordered_map<const std::type_info*, std::string> names;
    std::string& name = names[&typeid(object)];
    if (name.empty()) {
        name = platformName(object);
    }
    return name;
}

Json classNameOrNull(const NSObject* object) {
    return object ? Json(className(*object)) : Json(nullptr);
}

void watchLife(NSObject& object, const std::string& name, const std::shared_ptr<Trace>& trace) {
    if (!objc_getAssociatedObject(object, &lifeWatchKey)) {
        objc_setAssociatedObject(object, &lifeWatchKey, std::make_shared<LifeWatch>(name, trace),
                                 OBJC_ASSOCIATION_RETAIN_NONATOMIC);
    }
}

} // namespace quorl
