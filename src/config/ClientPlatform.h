// The operating system's name as GetClientPlatform reports it.
#pragma once

#include <kelcore/utility/StringTypes.h>

namespace kelcore::config {

// Read once; later calls return the same text.
UTF16String ReadClientPlatform();

}  // namespace kelcore::config
