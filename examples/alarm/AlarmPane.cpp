// When Velora is to wake whoever wears it: a switch, and a time that a pane of its own sets.

#include "platform/HostApp.h"
#include "platform/LocalizedText.h"

namespace {

constexpr LocalizedText alarmText{"ALARM_TITLE", "Alarm"};
constexpr LocalizedText timeText{"ALARM_TIME", "Time"};
constexpr LocalizedText laterText{"ALARM_LATER", "Half an Hour Later"};

struct {
    bool isOn = false;
    int minutes = 7 * 60; // after midnight
} state;

using Row = std::shared_ptr<PSSpecifier>;

Row newRow(NSObject& pane, const LocalizedText& name, PSCellType cell, std::optional<PSGetter> get,
           std::optional<PSSetter> set, std::optional<Class> detail) {
    return PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
        localized(pane, name), strong(&pane), set, get, detail, cell, std::nullopt);
}

NSArray<PSSpecifier> listOf(std::vector<Row> rows) {
    return std::make_shared<const std::vector<Row>>(std::move(rows));
}

/// The value of the row "Time" in both panes.
std::optional<std::string> alarmTime() {
    const auto digits = [](int number) { return std::to_string(100 + number).substr(1); };
    return digits(state.minutes / 60) + ":" + digits(state.minutes % 60);
}

} // namespace

/// The pane behind the row "Time".
class AlarmTimePane : public PSListController {
  public:
    bool init() override {
        const bool isMade = PSListController::init();
        setTitle(localized(*this, timeText));
        return isMade;
    }

    NSArray<PSSpecifier> specifiers() override {
        if (!_specifiers) {
            const auto get = PSGetter::of<&AlarmTimePane::time>("time");
            const auto set = PSSetter::of<&AlarmTimePane::setLater>("setLater");
            _specifiers = listOf({newRow(*this, timeText, PSCellType::TitleValue, get, {}, {}),
                                  newRow(*this, laterText, PSCellType::Button, {}, set, {})});
        }
        return _specifiers;
    }

  private:
    std::optional<std::string> time() { return alarmTime(); }

    void setLater() {
        state.minutes = (state.minutes + 30) % (24 * 60);
        reload();
    }
};

/// The first pane: the class that the registration names.
class AlarmPane : public QPSNotificationAppController {
  public:
    bool init() override {
        const bool isMade = QPSNotificationAppController::init();
        setTitle(localizedPaneTitle());
        return isMade;
    }

    std::string localizedPaneTitle() override { return localized(*this, alarmText); }

    NSArray<PSSpecifier> specifiers() override {
        if (!_specifiers) {
            const auto get = PSGetter::of<&AlarmPane::isOn>("isOn");
            const auto set = PSSetter::of<&AlarmPane::setOn>("setOn:");
            const auto time = PSGetter::of<&AlarmPane::time>("time");
            const auto detail = Class::of<AlarmTimePane>();
            _specifiers = listOf({newRow(*this, alarmText, PSCellType::Switch, get, set, {}),
                                  newRow(*this, timeText, PSCellType::LinkList, time, {}, detail)});
        }
        return _specifiers;
    }

    void viewWillAppear(bool animated) override {
        QPSNotificationAppController::viewWillAppear(animated);
        reload(); // the time may be another one
    }

  private:
    std::optional<std::string> isOn() {
        return std::string(state.isOn ? PSSwitchOnValue : PSSwitchOffValue);
    }

    void setOn(const std::shared_ptr<NSObject>& value, const Row& /*row*/) {
        state.isOn = NSNumber::of(value.get())->boolValue();
        reload();
    }

    std::optional<std::string> time() { return alarmTime(); }
};

QUORL_EXPORT_CLASS(AlarmPane)
