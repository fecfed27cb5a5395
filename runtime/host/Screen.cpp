#include "runtime/host/Screen.h"

#include <algorithm>
#include <cmath>

namespace quorl {

namespace {

constexpr CGFloat margin = 16;
constexpr CGFloat gap = 8;
constexpr CGFloat checkmarkWidth = 28;

CGRect centred(CGFloat x, CGFloat width, CGFloat height, CGFloat rowHeight) {
    return {x, (rowHeight - height) / 2, width, height};
}

/// The title on the left as wide as it wants to be, the detail right-aligned in what remains. The
/// gap is free whatever the title wants: a cell that widens its detail takes from the title alone.
void layOutSideBySide(UILabel& title, UILabel& detail, CGSize titleSize, CGSize detailSize,
                      CGFloat right, CGFloat rowHeight) {
    const CGFloat taken = detailSize.width > 0 ? gap : 0;
    const CGFloat width = std::max<CGFloat>(right - margin - taken, 0);
    titleSize.width = std::min(titleSize.width, width);
    detailSize.width = std::min(detailSize.width, width - titleSize.width);
    title.setFrame(centred(margin, titleSize.width, titleSize.height, rowHeight));
    detail.setFrame(
        centred(right - detailSize.width, detailSize.width, detailSize.height, rowHeight));
}

void layOutStacked(UILabel& title, UILabel& detail, CGSize titleSize, CGSize detailSize,
                   CGFloat right, CGFloat rowHeight) {
    const CGFloat width = std::max<CGFloat>(right - margin, 0);
    const CGFloat top = (rowHeight - titleSize.height - detailSize.height) / 2;
    title.setFrame({margin, top, std::min(titleSize.width, width), titleSize.height});
    detail.setFrame(
        {margin, top + titleSize.height, std::min(detailSize.width, width), detailSize.height});
}

} // namespace

void Screen::layOutLabels(UITableViewCell& cell) {
    const CGSize row = rowSize();
    const bool hasAccessory = cell.accessoryType() != UITableViewCellAccessoryType::None;
    const CGFloat right = row.width - margin - (hasAccessory ? checkmarkWidth : 0);
    const CGSize titleSize = sizeOfText(cell.textLabel());
    const CGSize detailSize = sizeOfText(cell.detailTextLabel());
    const auto layOut =
        cell.style() == UITableViewCellStyle::Subtitle ? layOutStacked : layOutSideBySide;
    layOut(cell.textLabel(), cell.detailTextLabel(), titleSize, detailSize, right, row.height);
}

} // namespace quorl
