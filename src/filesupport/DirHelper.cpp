#include <kelcore/filesupport/Dir.h>
#include <kelcore/filesupport/PathStrings.h>

#include "filesupport/FileHelper.h"

namespace kelcore::filesupport {

namespace FileUtils = utility::FileUtils;

DirHelper::DirHelper(const UTF16String& path) : path_(FileUtils::NormalizeDirPath(path)) {}

DirHelper::DirHelper(const std::string& systemPath)
    : path_(FileUtils::NormalizeDirPath(detail::PathFromSystemString(systemPath))) {}

DirHelper::DirHelper(const Dir& parent, const UTF16String& name) {
  UTF16String joined;
  FileUtils::BuildPathSpec(parent.FullPath(), name, joined);
  path_ = FileUtils::NormalizeDirPath(joined);
}

UTF16String DirHelper::FullNativePath() const {
  return detail::NativePathOf(path_);
}

}  // namespace kelcore::filesupport
