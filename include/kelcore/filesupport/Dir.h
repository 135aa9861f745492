// Dir: a copyable value that names a directory on disk, and DirHelper, the normalised
// path behind it.
//
// Like File, a Dir holds a path only and checks nothing when it is made. Its path is
// normalised by NormalizeDirPath (<kelcore/filesupport/PathStrings.h>): it never ends in a
// separator except for the POSIX root "/". Names that are not valid UTF-8 on disk are
// carried losslessly, as for File.
//
// Error mapping of the operations (errno as the system reports it):
//   Exists             never throws.
//   Create             an existing directory is success; a missing parent throws
//                      dir_not_found_exception holding the parent; any other failure
//                      (an existing file of that name, no permission, a read-only file
//                      system, a bad name) throws dir_create_exception.
//   Delete             a missing directory (ENOENT, or a file of that name: ENOTDIR)
//                      throws dir_not_found_exception; any other failure (not empty, no
//                      permission, busy) dir_delete_exception.
//   Rename             a missing source throws dir_not_found_exception; an existing entry
//                      of the new name rename_dir_already_exists; any other failure, and
//                      a new name holding a separator or equal to "", "." or "..",
//                      rename_dir.
//   Created, Modified  a missing directory throws dir_not_found_exception; other
//                      failures dir_exception.
// A failed operation leaves the Dir unchanged.
//
// Concurrency: as File (no internal locking; distinct objects on distinct threads).
#pragma once

#include <boost/date_time/posix_time/ptime.hpp>
#include <string>

#include <kelcore/Export.h>
#include <kelcore/filesupport/DirIterators.h>
#include <kelcore/filesupport/File.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::filesupport {

class KELCORE_API DirHelper {
 public:
  DirHelper() = default;
  // Copies the path and normalises it as a directory path.
  explicit DirHelper(const UTF16String& path);
  // A path in the system's own encoding (as FileHelper's).
  explicit DirHelper(const std::string& systemPath);
  // The parent's path, a separator, then `name`; normalised. An empty parent gives
  // `name` alone.
  DirHelper(const Dir& parent, const UTF16String& name);

  const UTF16String& Path() const noexcept { return path_; }
  // The path in the form handed to the system calls (unchanged on POSIX).
  UTF16String FullNativePath() const;

  bool operator==(const DirHelper& other) const noexcept { return path_ == other.path_; }

 private:
  UTF16String path_;
};

class KELCORE_API Dir {
 public:
  using FileIterator = DirFileIterator;
  using DirIterator = DirSubdirIterator;

  // An empty path.
  Dir() = default;
  explicit Dir(const UTF16String& path);
  explicit Dir(const std::string& systemPath);
  explicit Dir(const DirHelper& helper);
  Dir(const Dir& parent, const UTF16String& name);
  // As Dir(parent, name); when `createIfMissing` is true the directory is then created
  // (one level, as Create) unless it exists already.
  Dir(const Dir& parent, const UTF16String& name, bool createIfMissing);

  const DirHelper& Helper() const noexcept { return helper_; }

  // True when the path names a directory (symbolic links followed). Never throws.
  bool Exists() const;
  // Creates this one directory (its parent must exist), with the permissions 0777 less
  // the process's umask.
  void Create();
  // Deletes the directory, which must be empty.
  void Delete();
  // Renames the directory within its parent; an existing entry of the new name is never
  // replaced. On success this Dir names the new path.
  void Rename(const UTF16String& newName);

  // Times as File's: UTC, to the microsecond; creation is the birth time where the file
  // system records one, else the time of the last status change.
  boost::posix_time::ptime Created() const;
  boost::posix_time::ptime Modified() const;

  const UTF16String& FullPath() const noexcept { return helper_.Path(); }
  // The path as the bytes handed to the system.
  std::string FullPathMultiByte() const;
  // The last component; empty for the root "/".
  UTF16String GetName() const;
  // The directory above: "/" for "/a"; an empty Dir for the root, for a relative path of
  // one component and for an empty Dir.
  Dir Parent() const;
  // True for the root of the file system ("/" on POSIX).
  bool IsTopLevelDir() const;

  // The files of this directory (see <kelcore/filesupport/DirIterators.h> for the rules
  // shared by all listings).
  //   includeHidden: list names beginning with ".".
  //   abortQuery: optional; copied, so it need not outlive the call.
  //   followLinks: true: a symbolic link to a directory counts as a directory and is not
  //     listed, a link to anything else is listed; false: every symbolic link is listed
  //     as a file, whatever it points to (what a walk that deletes files wants).
  //   filter: optional; keeps the entries for which it returns true.
  FileIterator BeginFiles(bool includeHidden = false,
                          const AbortQueryFunction* abortQuery = nullptr, bool followLinks = true,
                          const NameFilter& filter = NameFilter()) const;
  static FileIterator EndFiles() { return FileIterator(); }

  // The subdirectories of this directory, symbolic links to directories included.
  DirIterator BeginSubdirs(bool includeHidden = false,
                           const AbortQueryFunction* abortQuery = nullptr,
                           const NameFilter& filter = NameFilter()) const;
  static DirIterator EndSubdirs() { return DirIterator(); }

  // The mount points of the system's mounted file systems (/proc/self/mountinfo on
  // Linux), each once, sorted by path ("/" first). The filter receives the file system
  // type ("ext4", "tmpfs", "proc", ...) as the name and the mount point as the path.
  // An unreadable mount table gives an empty listing.
  static DirIterator BeginVolumes(const NameFilter& filter = NameFilter());
  static DirIterator EndVolumes() { return DirIterator(); }

  // Equality and order of the normalised paths, code unit by code unit.
  bool operator==(const Dir& other) const noexcept { return helper_ == other.helper_; }
  bool operator<(const Dir& other) const noexcept { return helper_.Path() < other.helper_.Path(); }

 private:
  DirHelper helper_;
};

}  // namespace kelcore::filesupport
