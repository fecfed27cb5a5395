#pragma once

#include "platform/UserInterface.h"

namespace quorl {

/// A row that does something when it is tapped. Main thread.
class ButtonCell final : public UITableViewCell {};

} // namespace quorl
