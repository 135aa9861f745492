// The built-in commands that show the well-known directories and volumes and try the
// file and directory operations on a path.
//
// A step that raises one of the file exceptions is reported as "Threw file_exception"
// (or "Threw dir_exception") in place of its result, and the next step runs.
#pragma once

#include <kelcore/console/Command.h>

namespace kelcore::commands::filesupport {

// filesupport.listdirs: "commondirs Functions:" and one line per commondirs directory,
// then "Dir Methods:" and one line per Dir directory, each label followed by the path.
class ListDirs final : public console::Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, console::UTF16OutputStream& out) override;
};

// filesupport.listvols: "List Volumes:" and the path of every mounted volume.
class ListVols final : public console::Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, console::UTF16OutputStream& out) override;
};

// filesupport.file <file path>: the whole argument text, without surrounding spaces, is
// the path (so it may hold spaces). Writes, one per line:
//   File Path: <full path>
//    File found.  |  File not found.
//    Create: created the file.            only when it was not found
//    Created: <time>                      UTC, as boost's to_simple_string writes it
//    Modified: <time>
//    Name: <name>
//    Title: <title>
//    Extension: <extension>
//    Copy: compares equal.                a copy of the File compared with ==
//    Rename: <path of "house" beside it>
//    Rename back: <full path>             only when the rename succeeded
//    Delete: deleted the file.            only when this command created it
// A file that existed is never deleted or truncated: the delete and create steps run
// only on a file that the command made itself, so the file system is left as found.
class FileExists final : public console::Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, console::UTF16OutputStream& out) override;
};

// filesupport.dir <file path>: the same for a directory:
//   Directory Path: <full path>
//    Dir Name: <name>
//    Parent Path: <parent's full path>
//    Directory found.  |  Directory not found.
//    Create: created the directory.       only when it was not found
//    Created: <time>
//    Modified: <time>
//    Top Level: yes | no
//    Copy: compares equal.
//    Rename: <path of "house" beside it>
//    Rename back: <full path>
//    Delete: deleted the directory.       only when this command created it
class DirExists final : public console::Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, console::UTF16OutputStream& out) override;
};

}  // namespace kelcore::commands::filesupport
