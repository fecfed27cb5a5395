#include "runtime/lists/Label.h"

#include <algorithm>

#include "runtime/host/Host.h"
#include "runtime/host/Screen.h"

namespace quorl {

void Label::setFrame(const CGRect& frame) {
    frame_ = frame;
    Host::required().screen().labelDidSetFrame(*this);
}

CGSize Label::sizeThatFits(const CGSize& size) const {
    const CGSize needed = Host::required().screen().sizeOfText(*this);
    return {std::min(needed.width, size.width), std::min(needed.height, size.height)};
}

} // namespace quorl
