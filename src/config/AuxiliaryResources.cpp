#include "config/AuxiliaryResources.h"

#if defined(_WIN32)
#include "win/LibraryFolder.inc"
#else
#include "posix/LibraryFolder.inc"
#endif

namespace kelcore::config {

UTF16String GetAuxiliaryResourcesPath(const UTF16String& folderName, const UTF16String& leafName) {
  UTF16String path = GetLibraryFolder();
  if (path.empty()) return path;
  path.push_back(kNativeSeparator);
  path += folderName;
  path.push_back(kNativeSeparator);
  path += leafName;
  return path;
}

}  // namespace kelcore::config
