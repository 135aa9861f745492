// SafeSave: replaces a file so that its name never shows a half-written version.
//
//   SafeSave save(target);
//   FileUtils::SimpleWriteStringToFile(save.GetTempFile(), text);  // or any other writer
//   save.Commit();
//
// The constructor picks a temporary file beside the target (nothing is created on disk);
// the caller creates and writes it; Commit() puts it in the target's place. Destroying
// the object without a commit deletes the temporary file and leaves the target alone.
//
// Temporary name: the target's title, ".", the process id, ".", the thread id, then the
// counter of UniqueFileName (appended straight to the thread id, starting at 1) and the
// target's extension in lower case. "/docs/Report.XML", saved by process 1234 on thread
// 5678, is written first to "/docs/Report.1234.56781.xml". On POSIX the thread id is the
// kernel's thread id (gettid).
//
// Commit on POSIX, which leaves the target whole even if the process dies at any instant
// or the machine loses power once Commit has returned:
//   1. the temporary file is flushed to the disk (fsync);
//   2. it takes the permission bits (not the owner) of the file it replaces, if any;
//   3. one rename(2) puts it over the target: at every instant the name holds either the
//      old or the new content, never nothing;
//   4. the directory is flushed, so that the rename itself survives a power loss.
// A target that is a symbolic link keeps being a link: the file the link finally points
// to is replaced, and the temporary file is placed in that file's directory (chosen by
// the constructor) so that the rename stays within one file system.
// On Windows the old target is deleted first and the temporary file renamed; a failed
// delete is ignored, and the target may then be missing if the rename fails.
//
// Errors:
//   - constructor: dir_not_found_exception when the target's directory does not exist;
//   - Commit: rename_file (holding the temporary file and the target's name) when the
//     temporary file cannot be opened for flushing (it was never written, say) or the
//     rename fails; file_exception for the temporary file when flushing it fails
//     (a full disk or an I/O error): the target is then untouched in both cases.
//     file_exception for the target when flushing the directory fails after the rename:
//     the new content is in place, but its survival of a power loss is not assured.
//   - the destructor never throws.
// A save into a directory that may not be written fails when the caller creates the
// temporary file (create_accessdenied_exception from File::Create or
// SimpleWriteStringToFile); the target is then untouched.
//
// Concurrency: the process and thread ids in the name keep saves of one document by
// different threads or processes apart. One object is used by one thread.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/filesupport/File.h>

namespace kelcore::filesupport {

class KELCORE_API SafeSave {
 public:
  explicit SafeSave(const File& target);
  // Deletes the temporary file unless it was committed; swallows every failure.
  ~SafeSave();
  SafeSave(const SafeSave&) = delete;
  SafeSave& operator=(const SafeSave&) = delete;

  // The file to write. After a successful Commit it names the same path as the target.
  File& GetTempFile() { return temp_; }

  // Makes the temporary file the target (see above). May be called again after a failure.
  void Commit();

 private:
  // The file that Commit replaces: the target, or the file a symbolic link target
  // finally points to.
  File target_;
  File temp_;
};

}  // namespace kelcore::filesupport
