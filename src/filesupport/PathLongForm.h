// The Windows long path form ("\\?\" prefixes) as pure string code, so that the rule is
// built and tested on every host; only the Windows build hands its result to the system.
#pragma once

#include <kelcore/utility/StringTypes.h>

namespace kelcore::filesupport::detail {

// A UNC path with a share (at least 3 units, two leading backslashes and another
// backslash at or after position 2) gives "\\?\UNC\" followed by the path without its
// first two units; every other path, the empty one included, gives "\\?\" followed by
// the path. A path that already carries a prefix is not recognised as such: it goes
// through the same rules as any other. No length test is made.
inline UTF16String WindowsLongPathName(const UTF16String& path) {
  constexpr UTF16Char kBackslash = u'\\';
  const bool uncWithShare = path.size() >= 3 && path[0] == kBackslash && path[1] == kBackslash &&
                            path.find(kBackslash, 2) != UTF16String::npos;
  UTF16String result;
  if (uncWithShare) {
    static constexpr UTF16Char kUncPrefix[] = {'\\', '\\', '?', '\\', 'U', 'N', 'C', '\\', 0};
    result.reserve(path.size() + 6);
    result.append(kUncPrefix);
    result.append(path, 2, UTF16String::npos);
  } else {
    static constexpr UTF16Char kPrefix[] = {'\\', '\\', '?', '\\', 0};
    result.reserve(path.size() + 4);
    result.append(kPrefix);
    result.append(path);
  }
  return result;
}

}  // namespace kelcore::filesupport::detail
