#pragma once

#include "platform/Class.h"
#include "platform/NSBundle.h"
#include "platform/NSCollections.h"
#include "platform/NSDate.h"
#include "platform/NSError.h"
#include "platform/NSInteger.h"
#include "platform/NSNotificationCenter.h"
#include "platform/NSNumber.h"
#include "platform/NSObject.h"
#include "platform/NSString.h"
#include "platform/Selector.h"

/// Foundation services, and what every header of this folder goes by: unless said otherwise all of
/// it is for the main thread, texts are UTF-8, a text that may be missing is a
/// `std::optional<std::string>`, a `std::shared_ptr` owns what it points to and may be null only
/// where said, and a raw pointer or reference never owns.
