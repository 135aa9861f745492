// File: a copyable value that names a file on disk, and FileHelper, the normalised path
// behind it that performs the system calls.
//
// A File holds a path only; nothing is opened or checked when it is made. Paths are
// normalised by every constructor (NormalizeFilePath in
// <kelcore/filesupport/PathStrings.h>): on POSIX runs of "/" collapse and "\" is an
// ordinary character. A relative path is resolved against the process's current
// directory by every system call.
//
// Names on disk that are not valid UTF-8 are carried losslessly: each byte of an invalid
// sequence becomes one unpaired surrogate (U+DC80 to U+DCFF) in the UTF-16 path, and goes
// back to the same byte when the path is handed to the system, so a File found by a
// directory listing always names the entry it came from. FullPathMultiByte() gives the
// exact bytes.
//
// Errors: every failing operation throws one of the classes of
// <kelcore/filesupport/FileExceptions.h> and leaves the File unchanged. A path holding a
// NUL unit cannot be handed to the system; operations on it fail like an invalid path.
//
// Concurrency: no internal locking. Distinct objects may be used from different threads;
// one object may be read from several threads while none modifies it.
#pragma once

#include <boost/date_time/posix_time/ptime.hpp>
#include <cstdint>
#include <string>

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::filesupport {

class Dir;

// What File::Size measures.
enum class FileSizeSelector {
  kDataSize,       // the length of the file's contents in bytes (st_size)
  kAllocatedSize,  // the bytes the file takes on its volume (st_blocks * 512); smaller
                   // than the data size for sparse files, larger for most small files
};

class KELCORE_API FileHelper {
 public:
  FileHelper() = default;
  // Copies and normalises the path.
  explicit FileHelper(const UTF16String& path);
  // A path in the system's own encoding. On POSIX these are the bytes of a name on disk
  // (UTF-8 by convention, any bytes accepted; see the lossless mapping above). A string
  // that converts to nothing leaves the helper empty.
  explicit FileHelper(const std::string& systemPath);
  // The directory's path, a separator, then `name`; normalised. An empty directory gives
  // `name` alone, a relative path.
  FileHelper(const Dir& dir, const UTF16String& name);

  // The normalised path.
  const UTF16String& Path() const noexcept { return path_; }
  // The path in the form handed to the system calls (PrepAsLongPathName of the path on
  // Windows; the path unchanged on POSIX).
  UTF16String FullNativePath() const;

  bool operator==(const FileHelper& other) const noexcept { return path_ == other.path_; }

 private:
  UTF16String path_;
};

class KELCORE_API File {
 public:
  // An empty path: every query on it fails as for a missing file.
  File() = default;
  explicit File(const UTF16String& path);
  explicit File(const std::string& systemPath);
  explicit File(const FileHelper& helper);
  File(const Dir& dir, const UTF16String& name);
  // As File(dir, name); when `createIfMissing` is true the file is then created empty if
  // nothing of that name exists yet (an existing file is left untouched, never
  // truncated). Failure to create throws as Create does.
  File(const Dir& dir, const UTF16String& name, bool createIfMissing);

  const FileHelper& Helper() const noexcept { return helper_; }
  FileHelper& Helper() noexcept { return helper_; }

  // True when anything exists at the path, a directory included (symbolic links are
  // followed; a dangling link does not exist). Never throws.
  bool Exists() const;

  // Creates the file, empty, and closes it at once. With `failIfExists` an existing
  // entry of that name is an error; without it an existing file is truncated to zero
  // length. The system error selects the exception (codes of the library's error
  // vocabulary, errno mapped as in the platform notes):
  //   2, 6, 18, 107                                  create_fnf_exception
  //   3 (a missing parent directory, ENOTDIR)        create_invalidpath_exception
  //   5, 12, 29, 54, 58, 64, 65, 71, 80 (exists), 82, 86, 170, 183, 999
  //                                                  create_accessdenied_exception
  //   19 (read-only file system)                     create_locked_exception
  //   any other                                      create_exception
  void Create(bool failIfExists);

  // Deletes the file. Any failure (missing file, a directory, no permission) throws
  // file_delete_exception.
  void Delete();

  // Renames the file within its directory to `newName` (a plain name: one holding a
  // separator, an empty name, "." and ".." are refused). An existing entry of the new
  // name is never replaced. Any failure throws rename_file holding this file and
  // `newName`; on success this File names the new path.
  void Rename(const UTF16String& newName);

  // The size in bytes, as chosen by `which`. Symbolic links are followed. A missing
  // file or a directory throws file_not_found_exception; other failures file_exception.
  std::int64_t Size(FileSizeSelector which = FileSizeSelector::kDataSize) const;

  // True when the calling process may not write the file: its permissions (checked for
  // the effective user and groups, as the system would check an open for writing) or a
  // read-only file system forbid it. A process with the right to override permissions
  // (root) sees files on writable file systems as writable. A missing file throws
  // file_not_found_exception.
  bool IsReadOnly() const;

  // The creation time (the birth time where the file system records one, else the time
  // of the last status change), and the time of the last modification of the contents.
  // UTC, to the microsecond. A missing file throws file_not_found_exception.
  boost::posix_time::ptime Created() const;
  boost::posix_time::ptime Modified() const;

  // The normalised path.
  const UTF16String& FullPath() const noexcept { return helper_.Path(); }
  // The path as the bytes handed to the system (UTF-8 on POSIX, with the invalid bytes
  // of names on disk restored).
  std::string FullPathMultiByte() const;
  // The text after the last separator (the whole path when there is none).
  UTF16String GetName() const;
  // The name without its extension, and the extension with its dot (empty when the
  // name has none), as SplitLongPath splits them. With `lowerCase` the extension is
  // lowered unit by unit with the simple case mapping.
  UTF16String GetTitle() const;
  UTF16String GetExtension(bool lowerCase = false) const;
  // The directory holding the file: the path before the last separator ("/" for a file
  // in the root). A path without a separator gives an empty Dir.
  Dir Parent() const;

  bool operator==(const File& other) const noexcept { return helper_ == other.helper_; }

 private:
  FileHelper helper_;
};

}  // namespace kelcore::filesupport

// Dir completes the type that File::Parent returns; it includes this header in turn.
#include <kelcore/filesupport/Dir.h>
