#include "settings/LMQuorlLimitChooser.h"

#include <algorithm>
#include <array>

#include "platform/LocalizedText.h"
#include "platform/SizeFormatter.h"
#include "platform/SyncPreferences.h"

namespace {

constexpr LocalizedText titleText{"SYNC_SETTINGS_USAGE_LIMIT_TITLE", "Playlist Limit"};
constexpr LocalizedText storageText{"SYNC_SETTINGS_USAGE_LIMIT_TYPE_STORAGE", "Storage"};
constexpr LocalizedText songsText{"SYNC_SETTINGS_USAGE_LIMIT_TYPE_SONGS", "Songs"};
constexpr LocalizedText songsFormatText{"SYNC_SETTINGS_USAGE_LIMIT_TYPE_SONGS_FORMAT", "%tu Songs"};

enum Section : NSInteger { TypeSection = 0, AmountSection = 1 };

using Presets = std::array<NSUInteger, 4>;

// A row means the same position in both, which is how a choice carries over when the type changes.
constexpr Presets songPresets{15, 50, 125, 250};
constexpr Presets storagePresets{100, 500, 1024, 2048}; // megabytes

constexpr auto presetCount = static_cast<NSInteger>(songPresets.size());

const Presets& presetsOf(NSUInteger type) {
    return type == LMSyncLimitTypeSongs ? songPresets : storagePresets;
}

NSUInteger presetAt(NSUInteger type, NSInteger row) {
    return presetsOf(type)[static_cast<std::size_t>(row)];
}

/// The row of an amount among presets; the first one for an amount that is none of them.
NSInteger rowOf(NSUInteger amount, const Presets& presets) {
    const auto* found = std::find(presets.begin(), presets.end(), amount);
    return found == presets.end() ? 0 : found - presets.begin();
}

UITableViewCellAccessoryType checkmarkIf(bool isChosen) {
    return isChosen ? UITableViewCellAccessoryType::Checkmark : UITableViewCellAccessoryType::None;
}

void setAccessory(const UITableView& tableView, NSInteger row, NSInteger section, bool isChosen) {
    const auto path = NSIndexPath::indexPathForRow_inSection(row, section);
    if (const auto cell = tableView.cellForRowAtIndexPath(path)) {
        cell->setAccessoryType(checkmarkIf(isChosen));
    }
}

} // namespace

bool LMQuorlLimitChooser::init() {
    if (!initWithStyle(UITableViewStyle::Grouped)) {
        return false;
    }
    setTitle(localizedPaneTitle());
    return true;
}

std::string LMQuorlLimitChooser::localizedPaneTitle() { return localized(*this, titleText); }

void LMQuorlLimitChooser::viewWillAppear(bool animated) {
    LMQuorlDetailController::viewWillAppear(animated);
    _reloadData();
}

void LMQuorlLimitChooser::_reloadData() {
    const LMSyncDefaults& defaults = LMSyncDefaults::sharedDefaults();
    _type = defaults.assetSyncLimitType();
    const auto limit = defaults.assetSyncLimit();
    _amount = limit ? limit->unsignedIntegerValue() : 0;
    tableView().reloadData();
}

NSInteger LMQuorlLimitChooser::numberOfSectionsInTableView(UITableView& /*tableView*/) { return 2; }

NSInteger LMQuorlLimitChooser::tableView_numberOfRowsInSection(UITableView& /*tableView*/,
                                                               NSInteger section) {
    switch (section) {
    case TypeSection:
        return 2;
    case AmountSection:
        return presetCount;
    default:
        return -1;
    }
}

std::shared_ptr<UITableViewCell>
LMQuorlLimitChooser::tableView_cellForRowAtIndexPath(UITableView& tableView,
                                                     const NSIndexPath& path) {
    if (path.section != TypeSection && path.section != AmountSection) {
        return nullptr;
    }
    const char* identifier = path.section == TypeSection ? "0" : "1";
    auto cell = tableView.dequeueReusableCellWithIdentifier(identifier);
    if (!cell) {
        cell = create<UITableViewCell>(&UITableViewCell::initWithStyle_reuseIdentifier,
                                       UITableViewCellStyle::Subtitle, identifier);
        if (const auto color = PSListController::appearance().textColor) {
            cell->textLabel().setTextColor(color);
        }
    }
    if (path.section == TypeSection) {
        _configureTypeCell(*cell, path.row);
    } else {
        _configureAmountCell(*cell, path.row);
    }
    return cell;
}

void LMQuorlLimitChooser::_configureTypeCell(UITableViewCell& cell, NSInteger row) const {
    if (row == 0) {
        cell.textLabel().setText(localized(*this, storageText));
        cell.setAccessoryType(checkmarkIf(_type == LMSyncLimitTypeStorage));
    } else if (row == 1) {
        cell.textLabel().setText(localized(*this, songsText));
        cell.setAccessoryType(checkmarkIf(_type == LMSyncLimitTypeSongs));
    }
}

void LMQuorlLimitChooser::_configureAmountCell(UITableViewCell& cell, NSInteger row) const {
    const NSUInteger amount = presetAt(_type, row);
    // A type that is neither shows storage presets as songs: the two tests differ on purpose.
    cell.textLabel().setText(
        _type != LMSyncLimitTypeStorage
            ? NSString::localizedStringWithFormat(localized(*this, songsFormatText), {amount})
            : CPFSSizeStrings(static_cast<float>(amount << LMSyncLimitMegabyteShift)));
    cell.setAccessoryType(checkmarkIf(amount == _amount));
}

void LMQuorlLimitChooser::tableView_didSelectRowAtIndexPath(UITableView& tableView,
                                                            const NSIndexPath& path) {
    if (path.section != TypeSection) {
        _chooseAmount(tableView, path.row);
    } else {
        _chooseType(tableView, path.row == 0 ? LMSyncLimitTypeStorage : LMSyncLimitTypeSongs, path);
    }
    tableView.deselectRowAtIndexPath_animated(path, true);
    LMSyncDefaults& defaults = LMSyncDefaults::sharedDefaults();
    defaults.setAssetSyncLimit(NSNumber::numberWithUnsignedInteger(_amount));
    defaults.setAssetSyncLimitType(_type);
}

void LMQuorlLimitChooser::_chooseAmount(UITableView& tableView, NSInteger row) {
    _amount = presetAt(_type, row);
    for (NSInteger other = 0; other < presetCount; ++other) {
        setAccessory(tableView, other, AmountSection, other == row);
    }
}

void LMQuorlLimitChooser::_chooseType(UITableView& tableView, NSUInteger type,
                                      const NSIndexPath& path) {
    if (_type == type) {
        return;
    }
    _type = type;
    const bool isStorage = type == LMSyncLimitTypeStorage;
    const Presets& oldPresets = isStorage ? songPresets : storagePresets;
    _amount = presetAt(type, rowOf(_amount, oldPresets));
    setAccessory(tableView, path.row, TypeSection, true);
    setAccessory(tableView, isStorage ? 1 : 0, TypeSection, false);
    std::vector<NSIndexPath> amounts;
    for (NSInteger row = 0; row < presetCount; ++row) {
        amounts.push_back(NSIndexPath::indexPathForRow_inSection(row, AmountSection));
    }
    tableView.reloadRowsAtIndexPaths_withRowAnimation(amounts, UITableViewRowAnimation::Fade);
}
