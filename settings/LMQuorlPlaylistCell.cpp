#include "settings/LMQuorlPlaylistCell.h"

#include <algorithm>
#include <limits>

QUORL_EXPORT_CLASS(LMQuorlPlaylistCell)

namespace {

constexpr CGFloat leftmostDetail = 80;
constexpr CGFloat unbounded = std::numeric_limits<CGFloat>::max();

} // namespace

void LMQuorlPlaylistCell::layoutSubviews() {
    UITableViewCell::layoutSubviews();
    CGRect detail = detailTextLabel().frame();
    const CGSize needed = detailTextLabel().sizeThatFits({unbounded, unbounded});
    const CGFloat overflow = needed.width - detail.width;
    if (!(overflow > 0)) {
        return;
    }
    // Below 0 where the detail already starts left of its bound: then it is the one that gives way.
    const CGFloat growth = std::min(overflow, detail.x - leftmostDetail);
    detail.x -= growth;
    detail.width += growth;
    CGRect title = textLabel().frame();
    title.width -= growth;
    const CGFloat scale = UIScreen::mainScreen().scale();
    detailTextLabel().setFrame(UIRectIntegralWithScale(detail, scale));
    textLabel().setFrame(UIRectIntegralWithScale(title, scale));
}
