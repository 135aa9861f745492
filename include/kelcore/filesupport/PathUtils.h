// Path functions on wide strings and on File/Dir values: the operating system's long
// path form, file-name comparison, and the conversion between an absolute file and a
// normalised relative path.
//
// Two separators are used deliberately differently. Paths handed to the system (and
// held by File and Dir) use the native separator, '/' on POSIX and '\' on Windows.
// Normalised relative paths, the portable form in which documents store references to
// neighbouring files, always use '/', on every platform; '\' is never a separator in
// them (on POSIX it is an ordinary file-name character).
//
// All functions are reentrant and may be called from any thread. None of them touches
// the disk; only CompareFileNames reads process state (the default locale).
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::filesupport {

class File;
class Dir;

// The form of `path` handed to every system call (FileHelper::FullNativePath).
// Windows: a UNC path with a share (two leading backslashes and another backslash at
// or after position 2) becomes "\\?\UNC\" followed by the path without its first two
// characters; every other path, the empty one and one already prefixed included,
// becomes "\\?\" followed by the path. No length test is made.
// POSIX: the path unchanged (the system has no such prefix).
KELCORE_API UTF16String PrepAsLongPathName(const UTF16String& path);

// Orders two file names as the user expects: by the default locale's collation,
// ignoring case, character width (full-width "Ａ" equals "A") and kana type, but not
// accents ("é" differs from "e"). Returns -1, 0 or +1 over the whole of both strings.
// POSIX: an ICU collator for ICU's default locale at secondary strength. In the C or
// POSIX locale (ICU's "en_US_POSIX", whose tailoring makes case a primary difference)
// the root collation is used instead, so case is ignored whatever the locale. The whole
// of both strings counts: an embedded NUL unit does not end them (the collation itself
// ignores NUL and other control units). Should no collator be available (missing ICU
// data), the simple case-folded forms are compared code unit by code unit.
// Thread-safe: each thread compares with its own clone of a collator built once per
// locale; a change of ICU's default locale is seen by the next comparison.
KELCORE_API int CompareFileNames(const UTF16String& a, const UTF16String& b);

// True when `path` is exactly two characters and the second is ':' (such as "C:").
KELCORE_API bool IsPathDriveLetter(const UTF16String& path);

// False for an empty path, for one whose first character is '/' or '\', and for one
// whose second character is ':'; true otherwise. Only the form is tested.
KELCORE_API bool IsNormalizedRelativePath(const UTF16String& path);

// The path of `file` relative to the directory `base`, with '/' separators: the file's
// name when it lies in `base`, "../sibling/name" for a file in a sibling directory, and
// so on. Directories are matched with Dir's equality. When the two have no common
// ancestor (on Windows, another drive or share) the result is the empty string; on
// POSIX every absolute path shares the root "/".
KELCORE_API UTF16String MakeNormalizedRelativePath(const File& file, const Dir& base);
// The same, relative to the parent directory of `baseFile`.
KELCORE_API UTF16String MakeNormalizedRelativePath(const File& file, const File& baseFile);

// The file that the normalised relative `path` names from the directory `base`. A path
// that is not relative by IsNormalizedRelativePath (the empty one included) is taken as
// it is: File(path). Otherwise the path is walked with '/' as the separator: "." and
// empty components are skipped, ".." goes to the parent directory (staying at a
// top-level directory, which has none), any other component enters that
// subdirectory; the text after the last '/' names the file. A path ending in '/' names
// no file and gives an empty File.
KELCORE_API File MakeFileFromPath(const UTF16String& path, const Dir& base);
// The same, from the parent directory of `baseFile`.
KELCORE_API File MakeFileFromPath(const UTF16String& path, const File& baseFile);

}  // namespace kelcore::filesupport
