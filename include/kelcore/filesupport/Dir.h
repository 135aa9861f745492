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

// The system folders that the well-known directories are built on (see
// DirHelper::SystemDir for where each lies).
enum class SystemFolder {
  kAppData,             // the user's application data (settings)
  kDocuments,           // the user's documents
  kDesktop,             // the user's desktop
  kProgramFiles,        // where applications are installed
  kProgramFilesCommon,  // where files shared by applications are installed
  kCommonDocuments,     // documents shared by the family's applications
  kTemp,                // the temporary folder
};

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

  // Where a system folder lies, computed afresh on every call; one trailing separator
  // is removed. With `create` true a missing folder is created with every missing level
  // above it. Returns an empty Dir when the folder cannot be had: the environment names
  // no home directory, or the folder cannot be created when asked to be. Never throws
  // (std::bad_alloc aside). On POSIX (XDG base directories and user dirs, FHS):
  //   kAppData            $XDG_CONFIG_HOME, else $HOME/.config
  //   kDocuments          XDG_DOCUMENTS_DIR of $XDG_CONFIG_HOME/user-dirs.dirs (the
  //                       config folder as for kAppData), else $HOME/Documents
  //   kDesktop            XDG_DESKTOP_DIR of the same file, else $HOME/Desktop
  //   kProgramFiles       /opt
  //   kProgramFilesCommon /opt/common
  //   kCommonDocuments    $XDG_DATA_HOME/Varden/Shared, else
  //                       $HOME/.local/share/Varden/Shared
  //   kTemp               $TMPDIR, else /tmp
  // An XDG variable counts only when it holds an absolute path; $TMPDIR counts when it
  // is not empty. $HOME unset or empty falls back to the home directory of the user
  // database entry of the process's real user.
  static Dir SystemDir(SystemFolder id, bool create = false);

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

  // The well-known directories. Values that come from the system lose one trailing
  // separator. Caches are unsynchronised process-wide values: the host sets overrides
  // (<kelcore/filesupport/CommonDirs.h>) on its main thread at start-up, before other
  // threads ask for directories.
  //
  // The application directory: the override path when set (commondirs::SetAppDirOverride
  // or SetPackageDirOverride, which are one operation), else the folder of the process's
  // executable (/proc/self/exe on Linux), computed on first use and kept. Throws
  // dir_not_found_exception (with an empty Dir) when the executable's path cannot be
  // read.
  static Dir AppDir();
  // The same as AppDir: the two can never differ.
  static Dir PackageDir();
  // The common program files folder (SystemFolder::kProgramFilesCommon); AppDir when it
  // cannot be had.
  static Dir CommonFilesDir();
  // The family's shared folder inside the program files folder:
  // SystemDir(kProgramFiles) + "Varden" + "Common" (/opt/Varden/Common); an empty Dir
  // when the program files folder cannot be had. Not created.
  static Dir GlobalCommonFilesDir();
  // The user's application-data folder (SystemFolder::kAppData), created when missing;
  // AppDir when it cannot be had or created.
  static Dir GlobalPrefDir();
  // The host's preferences directory. When config::GetClientPrefsDir() is not empty,
  // the Dir of that path, created nowhere. Otherwise GlobalPrefDir + company name +
  // client name + client internal version (config::GetCompanyName, GetClientName,
  // GetClientInternalVersion), each level created when missing; a level that cannot
  // be created throws dir_create_exception for that level. An empty name adds no
  // level. Computed on every call.
  static Dir PrefDir();
  // The temporary folder (SystemFolder::kTemp). Not created.
  static Dir TempDir();
  // The user's documents folder, as commondirs::UserDocumentsDir (created when missing;
  // throws dir_exception when it cannot be had).
  static Dir UserDocsDir();
  // The documents shared by the family's applications, as
  // commondirs::AllUsersDocumentsDir (an empty Dir when it cannot be had).
  static Dir SharedDocsDir();

  // Equality and order of the normalised paths, code unit by code unit.
  bool operator==(const Dir& other) const noexcept { return helper_ == other.helper_; }
  bool operator<(const Dir& other) const noexcept { return helper_.Path() < other.helper_.Path(); }

 private:
  DirHelper helper_;
};

}  // namespace kelcore::filesupport
