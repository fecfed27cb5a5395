#pragma once

#include "settings/LMQuorlDetailController.h"
#include "settings/LMSyncLimitType.h"

/// The pane behind "Playlist Limit": what the limit counts, and one of four amounts of it. Every
/// tap writes both to the sync preferences. Main thread only.
class LMQuorlLimitChooser : public LMQuorlDetailController {
  public:
    [[nodiscard]] bool init() override;
    [[nodiscard]] std::string localizedPaneTitle();
    void viewWillAppear(bool animated) override;

    [[nodiscard]] NSInteger numberOfSectionsInTableView(UITableView& tableView) override;
    [[nodiscard]] NSInteger tableView_numberOfRowsInSection(UITableView& tableView,
                                                            NSInteger section) override;
    [[nodiscard]] std::shared_ptr<UITableViewCell>
    tableView_cellForRowAtIndexPath(UITableView& tableView, const NSIndexPath& path) override;
    void tableView_didSelectRowAtIndexPath(UITableView& tableView,
                                           const NSIndexPath& path) override;

    [[nodiscard]] PSController* parentController() const override { return _parentController; }

    void setParentController(PSController* controller) override { _parentController = controller; }

    [[nodiscard]] PSRootController* rootController() const override { return _rootController; }

    void setRootController(PSRootController* controller) override { _rootController = controller; }

    [[nodiscard]] std::shared_ptr<PSSpecifier> specifier() const override { return _specifier; }

    void setSpecifier(std::shared_ptr<PSSpecifier> specifier) override {
        _specifier = std::move(specifier);
    }

  protected:
    void _reloadData() override;

  private:
    void _configureTypeCell(UITableViewCell& cell, NSInteger row) const;
    void _configureAmountCell(UITableViewCell& cell, NSInteger row) const;
    void _chooseAmount(UITableView& tableView, NSInteger row);
    void _chooseType(UITableView& tableView, NSUInteger type, const NSIndexPath& path);

    NSUInteger _type = LMSyncLimitTypeStorage;
    NSUInteger _amount = 0;
    PSController* _parentController = nullptr;
    PSRootController* _rootController = nullptr;
    std::shared_ptr<PSSpecifier> _specifier;
};
