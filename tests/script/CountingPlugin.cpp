// A plug-in whose every answer is how many answers it has given by then.

#include "platform/HostApp.h"
#include "platform/Inspection.h"

class CountingPane : public QPSNotificationAppController {
  public:
    [[nodiscard]] std::string localizedPaneTitle() override { return "Counting"; }
};

QUORL_EXPORT_CLASS(CountingPane)

namespace {

int nextAnswer() {
    static int answers = 0;
    return ++answers;
}

class CountingPlaylist final : public MPMediaPlaylist {
  public:
    [[nodiscard]] std::uint64_t persistentID() const override { return id_; }

    [[nodiscard]] std::shared_ptr<NSObject>
    valueForProperty(MPMediaProperty /*property*/) const override {
        return nullptr;
    }

    [[nodiscard]] std::optional<std::string> name() const override { return std::nullopt; }

    [[nodiscard]] NSArray<MPMediaItem> items() const override { return nullptr; }

  private:
    std::uint64_t id_ = static_cast<std::uint64_t>(nextAnswer());
};

constexpr QuorlInspection inspection{
    .syncStage = []() -> NSInteger { return nextAnswer(); },
    .progress = [] { return static_cast<float>(nextAnswer()); },
    .completedAssetCount = [] { return static_cast<NSUInteger>(nextAnswer()); },
    .totalAssetCount = [] { return static_cast<NSUInteger>(nextAnswer()); },
    .assetSyncPlaylist = []() -> std::shared_ptr<MPMediaPlaylist> {
        return create<CountingPlaylist>();
    },
};

} // namespace

QUORL_EXPORT_INSPECTION(inspection)
