#pragma once

#include "platform/UserInterface.h"

/// A row of the playlist chooser: the playlist's name and, on the right, what its sync is doing.
/// Where both do not fit the name gives way and is shortened.
class LMQuorlPlaylistCell : public UITableViewCell {
  public:
    void layoutSubviews() override;
};
