#include "quorl-syncd/daemon/LocalMusic.h"

#include <utility>

#include "quorl-syncd/daemon/Lifeline.h"
#include "services/media/MusicFolder.h"
#include "services/preferences/ChosenPlaces.h"

namespace quorl::syncd {

namespace {

class LocalFolder final : public WatchedMusic {
  public:
    LocalFolder(engine::BusLoop& loop, const std::string& folder, LocalMusic::Changed changed)
        : folder_(folder, [&loop, tell = lifeline_.whileThere(std::move(changed))](
                              std::shared_ptr<const media::Inventory> inventory) {
              loop.post([tell, inventory = std::move(inventory)] { tell(inventory); });
          }) {}

    void rescan() override { folder_.rescan(); }

  private:
    Lifeline lifeline_;
    media::MusicFolder folder_;
};

} // namespace

std::string LocalMusic::usualFolder() { return preferences::usualMusicFolder(); }

std::unique_ptr<WatchedMusic> LocalMusic::watch(const std::string& folder, Changed changed) {
    return std::make_unique<LocalFolder>(loop_, folder, std::move(changed));
}

} // namespace quorl::syncd
