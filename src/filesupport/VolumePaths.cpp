#include <kelcore/filesupport/FileExceptions.h>
#include <kelcore/filesupport/FileNames.h>

#if defined(_WIN32)
#include "win/VolumePaths.inc"
#else
#include "posix/VolumePaths.inc"
#endif

namespace kelcore::utility::FileUtils {

bool GetVolumePath(const UTF16String& path, UTF16String& volumePath) {
  return FindVolumePath(path, volumePath);
}

bool IsRoot(const UTF16String& path) {
  UTF16String volumePath;
  if (!GetVolumePath(path, volumePath)) {
    throw filesupport::create_fnf_exception(filesupport::File(path));
  }
  return path == volumePath;
}

bool GetVolumeSpace(const UTF16String& path, VolumeSpace& space) {
  return ReadVolumeSpace(path, space);
}

}  // namespace kelcore::utility::FileUtils
