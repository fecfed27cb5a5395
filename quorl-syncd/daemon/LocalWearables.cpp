#include "quorl-syncd/daemon/LocalWearables.h"

#include <filesystem>
#include <optional>
#include <utility>

#include <poll.h>

#include "quorl-syncd/daemon/Lifeline.h"
#include "services/base/AtomicFile.h"
#include "services/base/MountWatch.h"
#include "services/base/RootWatch.h"
#include "services/wearable/UsageReader.h"

namespace quorl::syncd {

namespace {

class LocalWearable : public WatchedWearable {
  public:
    LocalWearable(engine::BusLoop& loop, wearable::Wearable identity)
        : loop_(loop), identity_(std::move(identity)), reader_(identity_) {}

    [[nodiscard]] const wearable::Wearable& identity() const override { return identity_; }

    void look(Reply reply) override {
        reader_.ask([&loop = loop_, reply = lifeline_.whileThere(std::move(reply))](
                        const Answer& answer) { loop.post([reply, answer] { reply(answer); }); });
    }

  protected:
    [[nodiscard]] engine::BusLoop& loop() { return loop_; }

    [[nodiscard]] base::FileDescriptor open() const {
        return base::openRoot(identity_.root.c_str());
    }

  private:
    engine::BusLoop& loop_;
    const wearable::Wearable identity_;
    Lifeline lifeline_;
    wearable::UsageReader reader_;
};

/// It cannot be plugged in or out, so there is nothing to notice.
class EmbeddedWearable final : public LocalWearable {
  public:
    EmbeddedWearable(engine::BusLoop& loop, std::uint64_t capacity)
        : LocalWearable(loop, wearable::Wearable::embedded(capacity)) {
        std::filesystem::create_directories(identity().root);
    }

    [[nodiscard]] wearable::Attachment attachment() override {
        return wearable::loadAttachment(open().get());
    }

    void save(const wearable::Attachment& attachment) override {
        wearable::saveAttachment(open().get(), attachment);
    }
};

class MountedWearable final : public LocalWearable {
  public:
    MountedWearable(engine::BusLoop& loop, const std::string& directory,
                    WearablePort::Noticed noticed)
        : LocalWearable(loop, wearable::Wearable::mounted(directory)),
          noticed_(std::move(noticed)),
          rootWatch_(identity().root),
          mountWatch_(identity().root) {
        loop.watch(rootWatch_.descriptor(), POLLIN, [this] {
            if (rootWatch_.take()) {
                tell(WearableNews::MayHaveChanged);
            }
        });
        loop.watch(mountWatch_.descriptor(), POLLPRI, [this] {
            if (mountWatch_.take()) {
                tell(wasMounted() ? WearableNews::WasMounted : WearableNews::MayHaveChanged);
            }
        });
    }

    ~MountedWearable() override {
        loop().unwatch(rootWatch_.descriptor());
        loop().unwatch(mountWatch_.descriptor());
    }

    [[nodiscard]] wearable::Attachment attachment() override { return {}; }

    void save(const wearable::Attachment& /*attachment*/) override {}

  private:
    /// A directory that once was a mounted wearable is none without it.
    [[nodiscard]] bool wasMounted() const {
        return !identity().isMountPoint && wearable::isMountPoint(identity().root);
    }

    /// May destroy this object.
    void tell(WearableNews news) const {
        const auto noticed = noticed_;
        noticed(news);
    }

    const WearablePort::Noticed noticed_;
    base::RootWatch rootWatch_;
    base::MountWatch mountWatch_;
};

} // namespace

std::unique_ptr<WatchedWearable> LocalWearables::watch(const std::string& directory,
                                                       Noticed noticed) {
    if (directory.empty()) {
        return std::make_unique<EmbeddedWearable>(loop_, embeddedCapacity_);
    }
    return std::make_unique<MountedWearable>(loop_, directory, std::move(noticed));
}

} // namespace quorl::syncd
