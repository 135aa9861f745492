// Whole-file helpers: writing and reading a file's contents as one string, making sure
// a directory exists, and choosing a name that nothing in a directory has yet.
//
// Errors are reported with the classes of <kelcore/filesupport/FileExceptions.h>. All
// functions are reentrant; the file system is shared, so two callers working on the
// same paths see each other's effects in no promised order.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

#include <string>

namespace kelcore::filesupport {
class File;
class Dir;
}  // namespace kelcore::filesupport

namespace kelcore::utility::FileUtils {

// Replaces the contents of `file` with the bytes of `content`, creating the file when it
// does not exist (permissions 0666 less the process's umask) and truncating it when it
// does; an existing file keeps its permissions and owner. The file is written in place,
// not through a temporary file: a failure part-way leaves it holding part of the
// content (use SafeSave where that matters). Throws:
//   - when the file cannot be opened, the create_exception subclass that File::Create
//     would raise for the same system error (a missing directory gives
//     create_invalidpath_exception or create_fnf_exception, no permission
//     create_accessdenied_exception, a read-only file system create_locked_exception);
//   - when writing or closing fails (a full disk, say), file_exception.
KELCORE_API void SimpleWriteStringToFile(const filesupport::File& file, const UTF8String& content);
KELCORE_API void SimpleWriteStringToFile(const filesupport::File& file, const std::string& content);

// Reads the whole of `file` into `content`, replacing what it held; the bytes come back
// exactly as written, NUL bytes and invalid UTF-8 included. Throws
// file_not_found_exception when the file does not exist or is a directory, and
// file_exception for any other failure (no permission, a read error); `content` is then
// unchanged.
KELCORE_API void SimpleReadFileToString(const filesupport::File& file, UTF8String& content);
KELCORE_API void SimpleReadFileToString(const filesupport::File& file, std::string& content);

// Makes sure `dir` exists as a directory, creating every missing level from the top
// down (permissions 0777 less the umask). A level that another process creates at the
// same moment counts as created. When a level cannot be created (no permission, a
// file of that name in the way, a read-only file system) throws dir_create_exception for
// that level; the levels above it that were created are left in place. An empty Dir
// throws dir_create_exception for it.
KELCORE_API void EnsureDirectoryExists(const filesupport::Dir& dir);

// A path in `dirPath` that nothing occupies yet: dirPath, the native separator (unless
// dirPath already ends in one), `base`, a decimal counter, then `extension` (which
// carries its own dot, if any), so "/docs", "Report", ".xml" gives "/docs/Report1.xml".
// The counter starts at 1 and is appended straight to the base; a candidate without a
// number is never tried. The first candidate for which the system reports no entry at
// all (a file, directory, or symbolic link, dangling or not) is returned; nothing is
// created, so two callers may receive the same name until one of them creates it.
// Throws dir_not_found_exception when `dirPath` is not an existing directory, and
// std::invalid_argument when `base` or `extension` holds a NUL unit.
KELCORE_API UTF16String UniqueFileName(const UTF16String& dirPath, const UTF16String& base,
                                       const UTF16String& extension);

}  // namespace kelcore::utility::FileUtils
