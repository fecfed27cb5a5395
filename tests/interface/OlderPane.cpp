// A pane as it was written for version 3.0 of the interface, of which it uses what panes are made
// of: a list with a getter and a setter, a detail pane that is a table with cells of its own,
// texts, a notification and delayed work.

#include "platform/Dispatch.h"
#include "platform/HostApp.h"

namespace {

constexpr const char* changed = "OlderChoiceDidChange";

struct {
    bool isOn = false;
    NSInteger choice = 0;
} state;

std::string nameOf(NSInteger choice) { return choice == 0 ? "First" : "Second"; }

} // namespace

class OlderCell : public UITableViewCell {
  public:
    void layoutSubviews() override {
        UITableViewCell::layoutSubviews();
        setTintColor(QPSQuorlTintColor());
    }
};

class OlderChooser : public UITableViewController, public PSController {
  public:
    bool init() override {
        setTitle("Choice");
        return initWithStyle(UITableViewStyle::Grouped);
    }

    NSInteger numberOfSectionsInTableView(UITableView& /*table*/) override { return 1; }

    NSInteger tableView_numberOfRowsInSection(UITableView& /*table*/,
                                              NSInteger /*section*/) override {
        return 2;
    }

    std::shared_ptr<UITableViewCell>
    tableView_cellForRowAtIndexPath(UITableView& table, const NSIndexPath& path) override {
        auto cell = table.dequeueReusableCellWithIdentifier("choice");
        if (!cell) {
            cell = create<OlderCell>(&UITableViewCell::initWithStyle_reuseIdentifier,
                                     UITableViewCellStyle::Value1, "choice");
        }
        cell->textLabel().setText(nameOf(path.row));
        cell->setAccessoryType(path.row == state.choice ? UITableViewCellAccessoryType::Checkmark
                                                        : UITableViewCellAccessoryType::None);
        cell->layoutSubviews();
        return cell;
    }

    void tableView_didSelectRowAtIndexPath(UITableView& table, const NSIndexPath& path) override {
        state.choice = path.row;
        table.deselectRowAtIndexPath_animated(path, true);
        table.reloadData();
        NSNotificationCenter::defaultCenter().postNotificationName_object(changed, nullptr);
    }

    PSController* parentController() const override { return _parent; }

    void setParentController(PSController* controller) override { _parent = controller; }

    PSRootController* rootController() const override { return _root; }

    void setRootController(PSRootController* controller) override { _root = controller; }

    std::shared_ptr<PSSpecifier> specifier() const override { return _specifier; }

    void setSpecifier(std::shared_ptr<PSSpecifier> specifier) override {
        _specifier = std::move(specifier);
    }

  private:
    PSController* _parent = nullptr;
    PSRootController* _root = nullptr;
    std::shared_ptr<PSSpecifier> _specifier;
};

class OlderPane : public QPSNotificationAppController {
  public:
    bool init() override {
        if (!QPSNotificationAppController::init()) {
            return false;
        }
        setTitle(localizedPaneTitle());
        NSNotificationCenter::defaultCenter().addObserver_selector_name_object(
            this, NSNotificationSelector::of<&OlderPane::choiceDidChange>("choiceDidChange"),
            changed, nullptr);
        return true;
    }

    ~OlderPane() override { NSNotificationCenter::defaultCenter().removeObserver(this); }

    std::string localizedPaneTitle() override {
        return bundle()->localizedStringForKey_value_table("OLDER_TITLE", "Older", std::nullopt);
    }

    std::shared_ptr<NSBundle> bundle() override {
        return NSBundle::bundleForClass(Class::ofObject(*this));
    }

    std::optional<std::string> applicationBundleIdentifier() override {
        return bundle()->bundleIdentifier();
    }

    NSArray<PSSpecifier> specifiers() override {
        if (!_specifiers) {
            const auto get = PSGetter::of<&OlderPane::isOn>("isOn");
            const auto set = PSSetter::of<&OlderPane::setOn>("setOn:");
            const auto choice = PSGetter::of<&OlderPane::choice>("choice");
            const auto make = PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit;
            const std::vector rows{make("On", strong(this), set, get, {}, PSCellType::Switch, {}),
                                   make("Choice", strong(this), {}, choice,
                                        Class::of<OlderChooser>(), PSCellType::LinkList, {})};
            _specifiers = std::make_shared<const std::vector<std::shared_ptr<PSSpecifier>>>(rows);
        }
        return _specifiers;
    }

  private:
    std::optional<std::string> isOn() {
        return std::string(state.isOn ? PSSwitchOnValue : PSSwitchOffValue);
    }

    void setOn(const std::shared_ptr<NSObject>& value,
               const std::shared_ptr<PSSpecifier>& specifier) {
        state.isOn = NSNumber::of(value.get())->boolValue();
        reloadSpecifier(specifier);
    }

    std::optional<std::string> choice() { return nameOf(state.choice); }

    void choiceDidChange() {
        dispatch_after(dispatch_time(DISPATCH_TIME_NOW, 1'000'000'000), dispatch_get_main_queue(),
                       [pane = weak(this)] {
                           if (const auto self = pane.lock()) {
                               self->reload();
                           }
                       });
    }
};

QUORL_EXPORT_CLASS(OlderPane)
