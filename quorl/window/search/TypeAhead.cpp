#include "quorl/window/search/TypeAhead.h"

#include "quorl/search/FoldedText.h"

namespace quorl {

namespace {

constexpr std::uint64_t pause = 1000; // milliseconds, after which another name begins

} // namespace

bool TypeAhead::isUnderWay(std::uint64_t time) const {
    return !beginning_.isEmpty() && time < lastTime_ + pause;
}

void TypeAhead::type(const QString& letters, std::uint64_t time) {
    isNew_ = !isUnderWay(time);
    beginning_ = (isNew_ ? QString() : beginning_) + folded(letters);
    lastTime_ = time;
}

} // namespace quorl
