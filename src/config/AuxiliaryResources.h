// Where the library finds resources that ship beside its own module file.
#pragma once

#include <kelcore/utility/StringTypes.h>

namespace kelcore::config {

// The directory that holds the kelcore library file (no trailing separator), found
// from an address inside the library; empty when the platform cannot tell.
UTF16String GetLibraryFolder();

// <folder of the kelcore library>/<folderName>/<leafName> with the native separator;
// empty when the library's folder is unknown.
UTF16String GetAuxiliaryResourcesPath(const UTF16String& folderName, const UTF16String& leafName);

}  // namespace kelcore::config
