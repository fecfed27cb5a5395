#include "quorl/pages/RemovePage.h"

#include "services/language/Translated.h"

namespace quorl {

using language::translated;

bool RemovePage::init() {
    setTitle(translated("Remove Music"));
    return AppPage::init();
}

AppPage::Rows RemovePage::rows() {
    if (state().wearable.songCount == 0) {
        return {group(std::nullopt, translated("There is no synced music on the Velora."))};
    }
    return {
        group(std::nullopt,
              translated(
                  "Removes all music that was synced to the Velora, and switches music sync off, "
                  "so that it does not come back. All other files on the Velora stay, and so does "
                  "all music on this device.")),
        button(translated("Remove All Synced Music"),
               PSSetter::of<&RemovePage::remove>("remove::"))};
}

void RemovePage::remove(const std::shared_ptr<NSObject>& /*nothing*/, const Row& /*row*/) {
    services().ask(&engine::Client::removeMusic);
}

} // namespace quorl
