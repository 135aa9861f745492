// Path strings: splitting, joining and normalising paths held as UTF-16 text.
//
// Pure string code: nothing here touches the file system, every function is reentrant
// and reports bad input by its result, never by an exception (std::bad_alloc aside).
//
// Each function follows the rules of one path style. The default is the style of the
// platform the library runs on; the other style can be asked for explicitly so that its
// rules can be used and tested on any host.
//
//   PathStyle::kWindows: "\" is the separator; "/" is accepted as one on input and
//     turned into "\" by normalisation. The "\\?\" and "\\?\UNC\" long-path prefixes
//     are removed by normalisation.
//   PathStyle::kPosix: "/" is the only separator. "\" is an ordinary file-name
//     character and is never converted.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::utility::FileUtils {

enum class PathStyle { kPosix, kWindows };

#if defined(_WIN32)
inline constexpr PathStyle kNativePathStyle = PathStyle::kWindows;
inline constexpr UTF16Char kNativeSeparator = L'\\';
#else
inline constexpr PathStyle kNativePathStyle = PathStyle::kPosix;
inline constexpr UTF16Char kNativeSeparator = u'/';
#endif

// The normalised form of a file path, as every File holds it. An empty path stays
// empty.
//   kWindows: every "/" becomes "\"; a leading "\\?\UNC\" becomes "\\" (the plain UNC
//     form), otherwise a leading "\\?\" is removed; then runs of "\" are collapsed to
//     one, starting at position 1, so the leading "\\" of a UNC path survives.
//   kPosix: every run of "/" is collapsed to one, a leading "//" included.
// A trailing separator is kept: "C:/a//b/" gives "C:\a\b\" (Windows), "/a//b/" gives
// "/a/b/" (POSIX).
KELCORE_API UTF16String NormalizeFilePath(const UTF16String& path,
                                          PathStyle style = kNativePathStyle);

// The normalised form of a directory path, as every Dir holds it: the file form above,
// then one trailing separator is removed. On POSIX the root "/" keeps its separator, so
// the only directory path that ends in "/" is "/" itself; on Windows the separator is
// removed whatever precedes it ("C:\" gives "C:").
KELCORE_API UTF16String NormalizeDirPath(const UTF16String& path,
                                         PathStyle style = kNativePathStyle);

// Splits a path into the directory, the title and the extension; each output is
// optional (null is skipped). The separator is the last "\" or "/" (Windows) or the last
// "/" (POSIX); the dot is the last ".".
//   dir: the text before the separator (without it), empty when there is none;
//   title: the text after the separator (from the start when there is none) up to,
//     not including, the dot when the dot lies after the separator, else to the end;
//   ext: when the dot lies after the separator, the text from the dot (included) to the
//     end; otherwise *ext is left untouched.
// So "C:\a\b.tar.gz" gives "C:\a", "b.tar", ".gz" and "C:\d.x\file" gives "C:\d.x",
// "file" and no extension.
KELCORE_API void SplitLongPath(const UTF16String& path, UTF16String* dir, UTF16String* title,
                               UTF16String* ext, PathStyle style = kNativePathStyle);

// out = dir, then a separator unless dir is empty or already ends in the style's
// separator ("\" or "/"), then name. `out` may alias neither input.
KELCORE_API void BuildPathSpec(const UTF16String& dir, const UTF16String& name, UTF16String& out,
                               PathStyle style = kNativePathStyle);

// The text after the last separator: "\" only on Windows (a path holding no "\" gives
// an empty string, even if it holds "/"), "/" on POSIX (a path holding no "/" gives an
// empty string as well).
KELCORE_API UTF16String GetPathFileName(const UTF16String& path,
                                        PathStyle style = kNativePathStyle);

// The parent of a path. Finds the last separator ("\" or "/" on Windows, "/" on
// POSIX).
//   kWindows: no separator, or one at position 0, returns false and leaves `out`
//     unchanged; otherwise `out` is the text before it, less one trailing "\", and the
//     result is true.
//   kPosix: no separator returns false and leaves `out` unchanged; a separator at
//     position 0 gives the root "/" ("/a" has the parent "/"), except for "/" itself,
//     which has no parent (false); otherwise `out` is the text before the separator,
//     less one trailing "/".
KELCORE_API bool GetParentPath(const UTF16String& path, UTF16String& out,
                               PathStyle style = kNativePathStyle);

}  // namespace kelcore::utility::FileUtils
