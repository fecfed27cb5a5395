#pragma once

#include <string>

#include "platform/NSObject.h"

/// An error that a service reports.
class NSError final : public NSObject {
  public:
    explicit NSError(std::string localizedDescription)
        : _localizedDescription(std::move(localizedDescription)) {}

    /// One sentence for a person, with what to do about it.
    [[nodiscard]] const std::string& localizedDescription() const { return _localizedDescription; }

  private:
    std::string _localizedDescription;
};
