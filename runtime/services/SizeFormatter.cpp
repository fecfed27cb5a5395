#include "platform/SizeFormatter.h"

#include "runtime/host/Host.h"

std::string CPFSSizeStrings(float bytes) { return quorl::Host::required().sizeText(bytes); }
