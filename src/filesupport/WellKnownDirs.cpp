// Dir's well-known directories: the system folders and the application directory.
#include <string_view>

#include <kelcore/config/ClientIdentity.h>
#include <kelcore/filesupport/CommonDirs.h>
#include <kelcore/filesupport/Dir.h>
#include <kelcore/filesupport/FileExceptions.h>
#include <kelcore/filesupport/FileUtils.h>
#include <kelcore/filesupport/PathStrings.h>

#include "filesupport/WellKnownDirsState.h"

#if defined(_WIN32)
#include "win/WellKnownDirs.inc"
#else
#include "posix/WellKnownDirs.inc"
#endif

namespace kelcore::filesupport {

namespace FileUtils = utility::FileUtils;

namespace {

// The one application-directory path; empty until first use or after an empty override.
UTF16String& ApplicationDirPath() {
  static UTF16String path;
  return path;
}

UTF16String AsciiName(std::string_view name) {
  return UTF16String(name.begin(), name.end());
}

UTF16String FolderOfExecutable() {
  const UTF16String executable = detail::ExecutableModulePath();
  UTF16String folder;
  FileUtils::SplitLongPath(executable, &folder, nullptr, nullptr);
  // An executable in the root directory: the separator is all there is of its folder.
  if (folder.empty() && !executable.empty() && executable.front() == FileUtils::kNativeSeparator) {
    folder.assign(1, FileUtils::kNativeSeparator);
  }
  return folder;
}

}  // namespace

namespace detail {

void SetApplicationDirPath(const UTF16String& path) {
  ApplicationDirPath() = path;
}

}  // namespace detail

Dir DirHelper::SystemDir(SystemFolder id, bool create) {
  // The Dir drops one trailing separator of the system's path.
  const Dir dir(SystemFolderPath(id));
  if (dir.FullPath().empty() || !create) return dir;
  try {
    FileUtils::EnsureDirectoryExists(dir);
  } catch (const dir_exception&) {
    return Dir();
  }
  return dir;
}

Dir Dir::AppDir() {
  UTF16String& path = ApplicationDirPath();
  if (path.empty()) {
    path = FolderOfExecutable();
    if (path.empty()) throw dir_not_found_exception(Dir());
  }
  return Dir(path);
}

Dir Dir::PackageDir() {
  return AppDir();
}

Dir Dir::CommonFilesDir() {
  const Dir dir = DirHelper::SystemDir(SystemFolder::kProgramFilesCommon);
  return dir.FullPath().empty() ? AppDir() : dir;
}

Dir Dir::GlobalCommonFilesDir() {
  const Dir programFiles = DirHelper::SystemDir(SystemFolder::kProgramFiles);
  if (programFiles.FullPath().empty()) return Dir();
  return Dir(Dir(programFiles, AsciiName("Varden")), AsciiName("Common"));
}

Dir Dir::GlobalPrefDir() {
  const Dir dir = DirHelper::SystemDir(SystemFolder::kAppData, true);
  return dir.FullPath().empty() ? AppDir() : dir;
}

Dir Dir::PrefDir() {
  const UTF16String& hostPrefs = config::GetClientPrefsDir();
  if (!hostPrefs.empty()) return Dir(hostPrefs);
  Dir level = GlobalPrefDir();
  for (const UTF16String* name :
       {&config::GetCompanyName(), &config::GetClientName(), &config::GetClientInternalVersion()}) {
    if (name->empty()) continue;
    level = Dir(level, *name);
    try {
      level.Create();  // an existing directory is success
    } catch (const dir_exception&) {
      throw dir_create_exception(level);
    }
  }
  return level;
}

Dir Dir::TempDir() {
  return DirHelper::SystemDir(SystemFolder::kTemp);
}

Dir Dir::UserDocsDir() {
  return commondirs::UserDocumentsDir();
}

Dir Dir::SharedDocsDir() {
  return commondirs::AllUsersDocumentsDir();
}

}  // namespace kelcore::filesupport
