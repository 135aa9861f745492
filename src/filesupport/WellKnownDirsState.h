// The process-wide state behind the well-known directories, shared by Dir's statics and
// the commondirs functions. Same threading rule as they: unsynchronised, set up on the
// main thread before other threads ask for directories.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::filesupport::detail {

// The path of the process's executable as the system reports it; empty when it cannot
// be read.
UTF16String ExecutableModulePath();

// Replaces the one application-directory path behind Dir::AppDir and Dir::PackageDir;
// an empty path makes the next call compute it again.
void SetApplicationDirPath(const UTF16String& path);

// Empties every cache and override of the well-known directories, so that the next call
// of each computes its default again. For tests, which change the environment between
// cases; exported from the library but not part of its installed interface.
KELCORE_API void ResetWellKnownDirs();

}  // namespace kelcore::filesupport::detail
