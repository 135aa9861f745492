// The commondirs functions: cached directories of the application and the user.
#include <kelcore/filesupport/CommonDirs.h>

#include <string_view>

#include <kelcore/config/ClientIdentity.h>
#include <kelcore/filesupport/FileExceptions.h>
#include <kelcore/filesupport/FileUtils.h>
#include <kelcore/filesupport/PathStrings.h>

#include "filesupport/WellKnownDirsState.h"

namespace kelcore::filesupport::commondirs {

namespace FileUtils = utility::FileUtils;

namespace {

constexpr char kUserDocsKey[] =
    "$$$/kelcore/filesupport/DirUserDocs=Could not find the user documents directory.";
constexpr char kDesktopKey[] =
    "$$$/kelcore/filesupport/DirDesktopDocs=Could not find the user desktop directory.";
constexpr char kFontCacheKey[] =
    "$$$/kelcore/filesupport/DirAppFontCache=Can't write to font cache directory.";

UTF16String AsciiName(std::string_view name) {
  return UTF16String(name.begin(), name.end());
}

struct Caches {
  Dir executable;
  File mainExecutable;
  Dir resources;
  Dir plugins;
  Dir requiredPlugins;
  Dir allUserPlugins;
  Dir userPlugins;
  Dir allUsersDocuments;
  Dir fontCache;
};

Caches& TheCaches() {
  static Caches caches;
  return caches;
}

// The cached value, computed by `compute` while the cache is empty.
template <class Value, class Compute>
Value Cached(Value& cache, Compute compute) {
  if (cache.FullPath().empty()) cache = compute();
  return cache;
}

Dir UserFolderOrThrow(SystemFolder id, const char* key) {
  const Dir dir = DirHelper::SystemDir(id, true);
  if (dir.FullPath().empty()) throw dir_exception(Dir(), key);
  return dir;
}

Dir ComputeAppFontCacheDir() {
  UTF16String path = UserCacheDir().FullPath();
  for (const UTF16String& name : {config::GetCompanyName(), config::GetApplicationName(),
                                  config::GetClientInternalVersion(), AsciiName("Typesupport")}) {
    UTF16String longer;
    FileUtils::BuildPathSpec(path, name, longer);
    path.swap(longer);
  }
  const Dir dir(path);
  try {
    FileUtils::EnsureDirectoryExists(dir);
  } catch (const dir_exception&) {
    throw dir_exception(Dir(), kFontCacheKey);
  }
  return dir;
}

}  // namespace

Dir ExecutableDir() {
  return Cached(TheCaches().executable, Dir::AppDir);
}
void SetExecutableDirOverride(const Dir& dir) {
  TheCaches().executable = dir;
}

File MainExecutableFile() {
  return Cached(TheCaches().mainExecutable, [] {
    const File file(detail::ExecutableModulePath());
    if (file.FullPath().empty()) throw file_not_found_exception(file);
    return file;
  });
}
void SetMainExecutableOverride(const File& file) {
  TheCaches().mainExecutable = file;
}

Dir ResourcesDir() {
  return Cached(TheCaches().resources, Dir::AppDir);
}
void SetResourcesDirOverride(const Dir& dir) {
  TheCaches().resources = dir;
}

Dir PluginsDir() {
  return Cached(TheCaches().plugins, [] { return Dir(Dir::AppDir(), AsciiName("Plug-ins")); });
}
void SetPluginsDirOverride(const Dir& dir) {
  TheCaches().plugins = dir;
}

Dir RequiredPluginsDir() {
  return Cached(TheCaches().requiredPlugins,
                [] { return Dir(Dir::AppDir(), AsciiName("Required")); });
}
void SetRequiredPluginsDirOverride(const Dir& dir) {
  TheCaches().requiredPlugins = dir;
}

Dir AllUserPluginsDir() {
  return Cached(TheCaches().allUserPlugins, [] {
    const Dir common = Dir::GlobalCommonFilesDir();
    return common.FullPath().empty() ? Dir() : Dir(common, AsciiName("Plug-ins"));
  });
}

Dir UserPluginsDir() {
  return Cached(TheCaches().userPlugins, AllUserPluginsDir);
}

Dir AllUsersDocumentsDir() {
  return Cached(TheCaches().allUsersDocuments,
                [] { return DirHelper::SystemDir(SystemFolder::kCommonDocuments); });
}

Dir UserDocumentsDir() {
  return UserFolderOrThrow(SystemFolder::kDocuments, kUserDocsKey);
}

Dir UserDesktopDir() {
  return UserFolderOrThrow(SystemFolder::kDesktop, kDesktopKey);
}

Dir CurrentUserDir() {
  return UserDocumentsDir().Parent();
}

Dir UserCacheDir() {
  return Dir::TempDir();
}

Dir AppFontCacheDir() {
  return Cached(TheCaches().fontCache, ComputeAppFontCacheDir);
}
void SetAppFontCacheDirOverride(const Dir& dir) {
  TheCaches().fontCache = dir;
}

void SetAppDirOverride(const Dir& dir) {
  detail::SetApplicationDirPath(dir.FullPath());
}
void SetPackageDirOverride(const Dir& dir) {
  detail::SetApplicationDirPath(dir.FullPath());
}

}  // namespace kelcore::filesupport::commondirs

namespace kelcore::filesupport::detail {

void ResetWellKnownDirs() {
  commondirs::TheCaches() = commondirs::Caches();
  SetApplicationDirPath(UTF16String());
}

}  // namespace kelcore::filesupport::detail
