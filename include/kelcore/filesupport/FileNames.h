// File names and volumes: cleaning a name typed by a user, the forms in which paths are
// saved and compared, and the volume (mount) that holds a path.
//
// All functions are reentrant and may be called from any thread. The string functions
// touch neither the disk nor any shared state; the volume functions read the system's
// mount table and file-system statistics on each call (nothing is cached).
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

#include <cstdint>

namespace kelcore::utility::FileUtils {

// The nine characters that may not appear in a file name on any platform the library
// serves: \ / : * ? " < > |
KELCORE_API const UTF16String& GetIllegalFilenameCharacters();

// Cleans one file name (not a path) in place so that every platform accepts it, and
// returns true when the name changed. `replacement` stands in for each offending
// character; 0 means remove it.
//  1. An empty name is left alone (false).
//  2. A replacement that is itself illegal, a control character (1 to 31), "." or " "
//     becomes "-".
//  3. Each illegal character, and  4. each control character (1 to 31), is replaced,
//     or removed.
//  5. Reserved device names (CON, PRN, AUX, NUL, COM1..COM9, LPT1..LPT9, matched
//     caselessly): a name that is exactly one gets the replacement appended ("-" when
//     removing: "con" gives "con-"); a name that starts with one followed by "." gets
//     that dot replaced ("nul.txt" gives "nul_txt" with "_"), or, when removing, the
//     reserved part replaced by "-" ("aux.txt" gives "-.txt"). "COM10" and "console"
//     are not reserved.
//  6. Trailing dots and spaces: with a replacement only the last character is replaced
//     when it is one; when removing, all of them go.
//  7. Leading dots: with a replacement a first "." is replaced; when removing, all
//     leading dots go.
//  8. When removing, a name left empty becomes "-".
// NUL units are not control characters here and are kept.
KELCORE_API bool ReplaceIllegalFileNameCharacters(UTF16String& name, UTF16Char replacement);

// The form in which a path is stored in documents and settings. The path's Unicode
// normalization form is kept as typed (normalization form code 4, "none"), so the
// result is a copy of `path`.
KELCORE_API UTF16String NormalizePathForSaving(const UTF16String& path);

// The saving form, simply case-folded (one unit at a time, locale-independent), for
// comparing paths as text.
KELCORE_API UTF16String NormalizePathForStringComparison(const UTF16String& path);

// True when the comparison forms of `a` and `b` are equal unit for unit. No separator
// is normalised: "/a" and "/a/" differ, and so do the composed and decomposed "é".
KELCORE_API bool PathsEqual(const UTF16String& a, const UTF16String& b);

// The volume path of `path`, that is the mount point of the file system holding it: of
// the mount points in the system's mount table, the longest that is a prefix of `path`
// at a component boundary ("/home" holds "/home/a" but not "/homework"). The path is
// taken as text, with runs of separators collapsed; "." and "..", and symbolic links,
// are not resolved and the path need not exist. Returns false and leaves
// `volumePath` unchanged for a path that is not absolute or when the mount table
// cannot be read. A volume path never ends in a separator, except the root "/".
KELCORE_API bool GetVolumePath(const UTF16String& path, UTF16String& volumePath);

// True when `path` is exactly its own volume path ("/", a mount point such as
// "/home"; "/home/" with its trailing separator is not). Throws
// kelcore::filesupport::create_fnf_exception for the path when the volume path cannot
// be found (see GetVolumePath).
KELCORE_API bool IsRoot(const UTF16String& path);

// The space of the file system holding the existing file or directory `path`, in
// bytes: `available` is what an unprivileged caller may still write, `total` the size
// of the file system. Returns false, leaving both unchanged, when the path does not
// exist or the system refuses to tell.
struct VolumeSpace {
  std::uint64_t available = 0;
  std::uint64_t total = 0;
};
KELCORE_API bool GetVolumeSpace(const UTF16String& path, VolumeSpace& space);

}  // namespace kelcore::utility::FileUtils
