#include "filesupport/FileHelper.h"

#include <kelcore/filesupport/Dir.h>
#include <kelcore/filesupport/File.h>
#include <kelcore/filesupport/PathStrings.h>

namespace kelcore::filesupport {

namespace FileUtils = utility::FileUtils;

FileHelper::FileHelper(const UTF16String& path) : path_(FileUtils::NormalizeFilePath(path)) {}

FileHelper::FileHelper(const std::string& systemPath)
    : path_(FileUtils::NormalizeFilePath(detail::PathFromSystemString(systemPath))) {}

FileHelper::FileHelper(const Dir& dir, const UTF16String& name) {
  UTF16String joined;
  FileUtils::BuildPathSpec(dir.FullPath(), name, joined);
  path_ = FileUtils::NormalizeFilePath(joined);
}

UTF16String FileHelper::FullNativePath() const {
  return detail::NativePathOf(path_);
}

}  // namespace kelcore::filesupport

#if defined(_WIN32)
#include "win/FileHelper.inc"
#else
#include "posix/FileHelper.inc"
#endif
