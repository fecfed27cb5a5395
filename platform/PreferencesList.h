#pragma once

#include "platform/UserInterface.h"

/// The preferences list framework: panes that are lists of rows, and the navigation between them.
/// Main thread only.

class PSSpecifier;

/// A row's getter: a method of the row's target that is given the row and gives its value text
/// back, null for no text.
using PSGetter =
    Selector<std::optional<std::string>(const std::shared_ptr<PSSpecifier>& specifier)>;

/// A row's setter: a method of the row's target that is given the new value and the row.
using PSSetter = Selector<void(const std::shared_ptr<NSObject>& value,
                               const std::shared_ptr<PSSpecifier>& specifier)>;

/// What a row is.
enum class PSCellType : NSInteger {
    Group = 0,      ///< starts a group: a title above its rows and a footer below them
    LinkList = 2,   ///< shows a value text and opens a detail pane
    TitleValue = 4, ///< shows a value text
    Switch = 6,     ///< is on or off: its value is `PSSwitchOnValue` or `PSSwitchOffValue`
    Button = 8,     ///< does what its setter does, which is given null, when it is tapped
};

/// The value texts of a switch.
extern const std::string_view PSSwitchOnValue;
extern const std::string_view PSSwitchOffValue;

/// The property of a group that holds the text below its rows; null for none.
extern const std::string_view PSFooterTextGroupKey;

/// The description of one row, or of one group.
class PSSpecifier : public NSObject {
  public:
    /// A new row. `target`, which the row does not own, answers `get` and `set`; `detail` is the
    /// controller that a tap on the row opens. Each but `cell` may be null.
    [[nodiscard]] static std::shared_ptr<PSSpecifier>
    preferenceSpecifierNamed_target_set_get_detail_cell_edit(
        std::optional<std::string> name, const std::shared_ptr<NSObject>& target,
        std::optional<PSSetter> set, std::optional<PSGetter> get, std::optional<Class> detail,
        PSCellType cell, std::optional<Class> edit);

    [[nodiscard]] const std::optional<std::string>& name() const { return _name; }

    [[nodiscard]] const std::optional<Class>& detailControllerClass() const { return _detail; }

    [[nodiscard]] PSCellType cellType() const { return _cell; }

    /// Null also where the target is gone.
    [[nodiscard]] std::shared_ptr<NSObject> target() const { return _target.lock(); }

    [[nodiscard]] const std::optional<PSSetter>& setter() const { return _set; }

    [[nodiscard]] const std::optional<PSGetter>& getter() const { return _get; }

    [[nodiscard]] const std::optional<Class>& editPaneClass() const { return _edit; }

    /// What the getter gives now; null without a getter, or where the target is gone.
    [[nodiscard]] std::optional<std::string> value();

    /// Gives the setter a new value, for a switch a truth value, for a button null; nothing without
    /// a setter, or where the target is gone.
    void setValue(const std::shared_ptr<NSObject>& value);

    /// Sets a property, or takes it away where `value` is null. What is on screen changes when the
    /// list is drawn again.
    void setProperty_forKey(std::optional<std::string> value, std::string_view key);

    /// A property, or null.
    [[nodiscard]] std::optional<std::string> propertyForKey(std::string_view key) const;

  private:
    std::optional<std::string> _name;
    std::weak_ptr<NSObject> _target;
    std::optional<PSSetter> _set;
    std::optional<PSGetter> _get;
    std::optional<Class> _detail;
    PSCellType _cell = PSCellType::Group;
    std::optional<Class> _edit;
    std::map<std::string, std::string, std::less<>> _properties;
};

class PSController;

/// The controller at the root of the navigation, which holds the stack of panes.
class PSRootController : public UIViewController {
  public:
    /// Shows `controller` on top of the stack and owns it while it is there.
    virtual void pushController_animated(const std::shared_ptr<PSController>& controller,
                                         bool animated) = 0;

    /// Opens the pane that `url` names; false where there is none.
    virtual bool openURL(const std::string& url) = 0;
};

/// What lets the system bring a pane back that was on screen earlier.
class PSStateRestoration {
  public:
    virtual ~PSStateRestoration() = default;

    /// Unless overridden: true.
    [[nodiscard]] virtual bool canBeShownFromSuspendedState() { return true; }
};

/// A controller that the list framework can show. A class that adopts it also derives from
/// `UIViewController`. Parent, root and specifier are set before the pane is shown; parent and root
/// outlive the pane and are not owned by it. Every other method may be left out: it does nothing
/// then, and gives null where it gives something.
class PSController : public PSStateRestoration {
  public:
    [[nodiscard]] virtual PSController* parentController() const = 0;
    virtual void setParentController(PSController* controller) = 0;
    [[nodiscard]] virtual PSRootController* rootController() const = 0;
    virtual void setRootController(PSRootController* controller) = 0;

    /// The row that opened the pane; null for a root pane.
    [[nodiscard]] virtual std::shared_ptr<PSSpecifier> specifier() const = 0;
    virtual void setSpecifier(std::shared_ptr<PSSpecifier> specifier) = 0;

    /// Shows another controller over this one.
    virtual void showController(const std::shared_ptr<PSController>& /*controller*/) {}

    virtual void showController_animate(const std::shared_ptr<PSController>& /*controller*/,
                                        bool /*animate*/) {}

    /// Opens what `url` names within the pane.
    virtual void handleURL(const std::string& /*url*/) {}

    [[nodiscard]] virtual std::shared_ptr<NSObject>
    readPreferenceValue(const std::shared_ptr<PSSpecifier>& /*specifier*/) {
        return nullptr;
    }

    virtual void setPreferenceValue_specifier(const std::shared_ptr<NSObject>& /*value*/,
                                              const std::shared_ptr<PSSpecifier>& /*specifier*/) {}

    /// What happens to the app and the device while the pane is there.
    virtual void suspend() {}

    virtual void didLock() {}

    virtual void willUnlock() {}

    virtual void didUnlock() {}

    virtual void didWake() {}

    virtual void willBecomeActive() {}

    virtual void willResignActive() {}

    /// The bar at the top of the screen is about to change its height by `height` points.
    virtual void statusBarWillAnimateByHeight(double /*height*/) {}
};

/// How lists look, as the host set it.
struct PSListAppearance {
    std::optional<UIColor> textColor; ///< null for the host's own
};

/// A pane that is a list of rows.
class PSListController : public UIViewController, public PSController {
  public:
    /// False where no host is there to show the list.
    [[nodiscard]] bool init() override;

    /// The appearance that the host gave to all lists.
    [[nodiscard]] static PSListAppearance appearance();

    /// The rows, from top to bottom. An override builds them once into `_specifiers`.
    [[nodiscard]] virtual NSArray<PSSpecifier> specifiers();

    /// Calls the getter of a row of the list again, shown or hidden, and draws the row. Null, or a
    /// row before the list was built: does nothing.
    virtual void reloadSpecifier(const std::shared_ptr<PSSpecifier>& specifier);

    /// Has the whole list drawn again: titles, footers and values.
    virtual void reload();

    void viewDidAppear(bool animated) override;

    /// What a person sees of the list, which is the runtime's own; it lives as long as the
    /// controller.
    [[nodiscard]] NSObject& listView() const { return *_listView; }

    [[nodiscard]] PSController* parentController() const override;
    void setParentController(PSController* controller) override;
    [[nodiscard]] PSRootController* rootController() const override;
    void setRootController(PSRootController* controller) override;
    [[nodiscard]] std::shared_ptr<PSSpecifier> specifier() const override;
    void setSpecifier(std::shared_ptr<PSSpecifier> specifier) override;
    void showController(const std::shared_ptr<PSController>& controller) override;
    void showController_animate(const std::shared_ptr<PSController>& controller,
                                bool animate) override;
    void handleURL(const std::string& url) override;

  protected:
    /// The cached rows; null until `specifiers` has built them.
    NSArray<PSSpecifier> _specifiers;

  private:
    void show(const std::shared_ptr<PSController>& controller, std::optional<bool> animate);

    std::shared_ptr<NSObject> _listView;
    PSController* _parentController = nullptr;
    PSRootController* _rootController = nullptr;
    std::shared_ptr<PSSpecifier> _specifier;
};
