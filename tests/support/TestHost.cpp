#include "tests/support/TestHost.h"

#include "runtime/objects/MainQueue.h"

namespace quorl::tests {

TestHost::TestHost() : TestHost(std::make_shared<Journal>()) {}

TestHost::TestHost(const std::shared_ptr<Journal>& recorder)
    : HostDouble(recorder), journal(*recorder) {
    (void)mainQueueDescriptor(); // before any thread is started
    mediaLibrary().setMediaTypes(MPMediaTypeMusic);
    wearable.holdReplies();
    clock.moveBy(std::chrono::seconds(1'700'000'000));
    screen().looks.scale = 1;
    sizeTexts = SizeTexts::Platform;
}

std::shared_ptr<TestHost> TestHost::installed() {
    auto host = std::make_shared<TestHost>();
    install(host);
    return host;
}

} // namespace quorl::tests
