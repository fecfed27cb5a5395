#pragma once

#include "platform/NSObject.h"

/// A moment of the wall clock. Immutable.
class NSDate final : public NSObject {
  public:
    /// `seconds` since the start of 1970, UTC.
    explicit NSDate(double seconds) : _seconds(seconds) {}

    /// Now.
    [[nodiscard]] static std::shared_ptr<NSDate> date();

    /// Seconds from `earlier` to this; negative when `earlier` is the later one.
    [[nodiscard]] double timeIntervalSinceDate(const NSDate& earlier) const;

  private:
    double _seconds;
};
