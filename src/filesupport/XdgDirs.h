// Where the system folders lie on a desktop following the XDG base-directory and user-dirs
// conventions and the FHS, computed from the environment and the text of the user-dirs
// file handed in, so that the rules can be used and tested without touching the process.
//
// Paths are byte strings as the system hands them over (any bytes, UTF-8 by
// convention); nothing is decoded, checked on disk or normalised beyond what each
// function states. An empty result means the folder cannot be had.
//
// Pure functions: reentrant, no shared state; only std::bad_alloc is thrown.
#pragma once

#include <optional>
#include <string>
#include <string_view>

#include <kelcore/filesupport/Dir.h>

namespace kelcore::filesupport::detail {

// What the rules read from the process. An unset variable is an empty string.
struct XdgEnvironment {
  std::string home;        // $HOME, or the home directory of the user's database entry
  std::string configHome;  // $XDG_CONFIG_HOME
  std::string dataHome;    // $XDG_DATA_HOME
  std::string tmpDir;      // $TMPDIR
};

// $XDG_CONFIG_HOME when it is an absolute path, else home + "/.config"; empty when
// neither can be had. The user-dirs file is "user-dirs.dirs" in this folder.
std::string XdgConfigHome(const XdgEnvironment& env);

// $XDG_DATA_HOME when it is an absolute path, else home + "/.local/share"; empty when
// neither can be had.
std::string XdgDataHome(const XdgEnvironment& env);

// The value that the user-dirs file text `fileText` gives to XDG_<name>_DIR (name as
// "DOCUMENTS", "DESKTOP"), or nullopt when it gives none. The file is a shell fragment;
// it is read the way the shell would assign it:
//  - lines end at "\n"; leading spaces and tabs are skipped; a line beginning with "#"
//    or with anything but the variable's name is ignored;
//  - the name may be followed by spaces or tabs, then "=", then spaces or tabs, then the
//    value: either quoted ("..."), ending at the next unescaped quote (a line whose quote
//    is never closed is ignored), or unquoted, ending at a space, tab, "\r" or "#";
//    anything after the value is ignored; "\" takes the next character literally;
//  - a value beginning with "$HOME" or "${HOME}", followed by "/" or nothing, has that
//    prefix replaced by `home` (such a line is ignored when `home` is empty); any other
//    value must be an absolute path, else the line is ignored;
//  - when several lines assign the variable, the last one that counts wins.
std::optional<std::string> FindXdgUserDir(std::string_view fileText, std::string_view name,
                                          std::string_view home);

// The path of a system folder (see DirHelper::SystemDir for the table). `userDirsText`
// is the user-dirs file's text, consulted for kDocuments and kDesktop only (empty when
// the file is missing). The path is returned as formed, possibly with a trailing or
// doubled "/" taken from the environment.
std::string XdgSystemFolder(SystemFolder id, const XdgEnvironment& env,
                            std::string_view userDirsText);

}  // namespace kelcore::filesupport::detail
