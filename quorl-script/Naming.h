#pragma once

#include <memory>

#include "platform/Foundation.h"
#include "quorl-script/Trace.h"

namespace quorl {

/// The class of an object as traces call it: for the host's own objects the class of the platform
/// that they stand for. It lives as long as the object and the thread.
[[nodiscard]] const std::string& className(const NSObject& object);

/// The same as JSON, null for null.
[[nodiscard]] Json classNameOrNull(const NSObject* object);

/// Has `trace` note when `object` is destroyed, once however often it is asked for. `name` is what
/// it is called then.
void watchLife(NSObject& object, const std::string& name, const std::shared_ptr<Trace>& trace);

} // namespace quorl
