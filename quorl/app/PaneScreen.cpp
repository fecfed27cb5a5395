#include "quorl/app/PaneScreen.h"

#include <QPointer>

#include "platform/Dispatch.h"

namespace quorl {

PaneScreen::PaneScreen() {
    timer_.setSingleShot(true);
    timer_.setInterval(0);
    connect(&timer_, &QTimer::timeout, this, &PaneScreen::drawing);
}

void PaneScreen::scheduleDrawing() {
    if (!timer_.isActive()) {
        timer_.start();
    }
}

void PaneScreen::whenDrawn(QObject& waiting, std::function<void()> next) {
    constexpr auto once =
        static_cast<Qt::ConnectionType>(Qt::QueuedConnection | Qt::SingleShotConnection);
    dispatch_async(dispatch_get_main_queue(),
                   [this, waiting = QPointer(&waiting), next = std::move(next)] {
                       if (waiting) {
                           connect(this, &PaneScreen::drawing, waiting, next, once);
                           scheduleDrawing();
                       }
                   });
}

UIColor PaneScreen::tintColor() const { return tintName; }

std::optional<UIColor> PaneScreen::listTextColor() const { return std::nullopt; }

void PaneScreen::specifierWillSetProperty(PSSpecifier& /*specifier*/,
                                          const std::optional<std::string>& /*value*/,
                                          std::string_view /*key*/) {
    scheduleDrawing();
}

void PaneScreen::listWillReloadSpecifier(PSListController& /*list*/,
                                         const PSSpecifier* /*specifier*/) {
    scheduleDrawing();
}

void PaneScreen::listWillReload(PSListController& /*list*/) { scheduleDrawing(); }

void PaneScreen::listWillShowController(PSListController& /*list*/, PSController* /*controller*/,
                                        std::optional<bool> /*animate*/) {
    scheduleDrawing();
}

void PaneScreen::tableWillReloadData(UITableView& /*table*/) { scheduleDrawing(); }

void PaneScreen::tableWillReloadRows(UITableView& table, const std::vector<NSIndexPath>& paths,
                                     UITableViewRowAnimation /*animation*/) {
    Q_EMIT rowsWillFade(table, paths);
    scheduleDrawing();
}

void PaneScreen::tableWillDeselectRow(UITableView& table, const NSIndexPath& path, bool animated) {
    Q_EMIT rowWillBeDeselected(table, path, animated);
    scheduleDrawing();
}

} // namespace quorl
