// The directories that an application of the family needs: its executable and resources,
// its plug-in folders, the user's documents and desktop, a cache and the font cache.
//
// Most results are computed on first use and cached for the life of the process; a
// cache counts as empty while its path is empty, so an empty result is computed again
// on the next call. The overrides simply assign a cache: call them before the first use
// of the directory they set. An override with an empty Dir or File makes its function
// compute the default again on the next call. No result is checked for existence
// unless stated.
//
// Concurrency: the caches and override slots are unsynchronised process-wide values.
// The host sets the overrides on its main thread at start-up, before other threads ask
// for directories; after that, calls from several threads at once are safe only once
// every cache they touch has been filled.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/filesupport/Dir.h>
#include <kelcore/filesupport/File.h>

namespace kelcore::filesupport::commondirs {

// Dir::AppDir. Cached.
KELCORE_API Dir ExecutableDir();
KELCORE_API void SetExecutableDirOverride(const Dir& dir);

// The process's executable (/proc/self/exe on Linux). Cached. Throws
// file_not_found_exception (with an empty File) when its path cannot be read.
KELCORE_API File MainExecutableFile();
KELCORE_API void SetMainExecutableOverride(const File& file);

// Dir::AppDir. Cached.
KELCORE_API Dir ResourcesDir();
KELCORE_API void SetResourcesDirOverride(const Dir& dir);

// Dir::AppDir + "Plug-ins". Cached.
KELCORE_API Dir PluginsDir();
KELCORE_API void SetPluginsDirOverride(const Dir& dir);

// Dir::AppDir + "Required". Cached.
KELCORE_API Dir RequiredPluginsDir();
KELCORE_API void SetRequiredPluginsDirOverride(const Dir& dir);

// The plug-ins shared by all users: Dir::GlobalCommonFilesDir + "Plug-ins"
// (/opt/Varden/Common/Plug-ins); an empty Dir when the program files folder cannot be
// had. Cached.
KELCORE_API Dir AllUserPluginsDir();
// AllUserPluginsDir. Cached.
KELCORE_API Dir UserPluginsDir();

// The documents shared by the family's applications (SystemFolder::kCommonDocuments),
// not created; an empty Dir when the folder cannot be had. Cached.
KELCORE_API Dir AllUsersDocumentsDir();

// The user's documents and desktop folders (SystemFolder::kDocuments, kDesktop), created
// when missing. Computed on every call. When the folder cannot be had or created,
// throws dir_exception with an empty Dir and the key
// "$$$/kelcore/filesupport/DirUserDocs=Could not find the user documents directory."
// or "$$$/kelcore/filesupport/DirDesktopDocs=Could not find the user desktop directory."
KELCORE_API Dir UserDocumentsDir();
KELCORE_API Dir UserDesktopDir();

// The parent of UserDocumentsDir (throws as it does). Computed on every call.
KELCORE_API Dir CurrentUserDir();

// Dir::TempDir. Computed on every call.
KELCORE_API Dir UserCacheDir();

// UserCacheDir + company name + application name + client internal version +
// "Typesupport" (config::GetCompanyName, GetApplicationName, GetClientInternalVersion;
// an empty name adds no level), created with every missing level. Cached. When it
// cannot be created, throws dir_exception with an empty Dir and the key
// "$$$/kelcore/filesupport/DirAppFontCache=Can't write to font cache directory."
KELCORE_API Dir AppFontCacheDir();
KELCORE_API void SetAppFontCacheDirOverride(const Dir& dir);

// Both replace the one application-directory path behind Dir::AppDir and
// Dir::PackageDir with the argument's full path, so the two never differ. They do not
// touch the caches above that were already filled from it.
KELCORE_API void SetAppDirOverride(const Dir& dir);
KELCORE_API void SetPackageDirOverride(const Dir& dir);

}  // namespace kelcore::filesupport::commondirs
