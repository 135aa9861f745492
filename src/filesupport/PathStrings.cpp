#include <kelcore/filesupport/PathStrings.h>

#include <utility>

namespace kelcore::utility::FileUtils {

namespace {

constexpr UTF16Char kSlash = u'/';
constexpr UTF16Char kBackslash = u'\\';

UTF16Char SeparatorOf(PathStyle style) {
  return style == PathStyle::kWindows ? kBackslash : kSlash;
}

// The position of the last separator of the style, or npos.
std::size_t LastSeparator(const UTF16String& path, PathStyle style) {
  static constexpr UTF16Char kBoth[] = {kBackslash, kSlash, 0};
  return style == PathStyle::kWindows ? path.find_last_of(kBoth) : path.rfind(kSlash);
}

// Removes the second of every pair of adjacent `separator`s from position `from` on.
void CollapseRuns(UTF16String& path, UTF16Char separator, std::size_t from) {
  if (path.size() <= from) return;
  std::size_t out = from + 1;
  for (std::size_t in = from + 1; in < path.size(); ++in) {
    if (path[in] == separator && path[out - 1] == separator) continue;
    path[out++] = path[in];
  }
  path.resize(out);
}

void NormalizeWindows(UTF16String& path) {
  for (UTF16Char& c : path) {
    if (c == kSlash) c = kBackslash;
  }
  static constexpr UTF16Char kLongUnc[] = {kBackslash, kBackslash, '?', kBackslash,
                                           'U',        'N',        'C', kBackslash};
  static constexpr UTF16Char kLong[] = {kBackslash, kBackslash, '?', kBackslash};
  if (path.compare(0, 8, kLongUnc, 8) == 0) {
    path.erase(2, 6);
  } else if (path.compare(0, 4, kLong, 4) == 0) {
    path.erase(0, 4);
  }
  CollapseRuns(path, kBackslash, 1);
}

}  // namespace

UTF16String NormalizeFilePath(const UTF16String& path, PathStyle style) {
  UTF16String result = path;
  if (result.empty()) return result;
  if (style == PathStyle::kWindows) {
    NormalizeWindows(result);
  } else {
    CollapseRuns(result, kSlash, 0);
  }
  return result;
}

UTF16String NormalizeDirPath(const UTF16String& path, PathStyle style) {
  UTF16String result = NormalizeFilePath(path, style);
  const UTF16Char separator = SeparatorOf(style);
  const bool posixRoot = style == PathStyle::kPosix && result.size() == 1;
  if (!result.empty() && result.back() == separator && !posixRoot) result.pop_back();
  return result;
}

void SplitLongPath(const UTF16String& path, UTF16String* dir, UTF16String* title, UTF16String* ext,
                   PathStyle style) {
  const std::size_t separator = LastSeparator(path, style);
  const std::size_t dot = path.rfind(UTF16Char('.'));
  const std::size_t titleStart = separator == UTF16String::npos ? 0 : separator + 1;
  const bool hasExtension = dot != UTF16String::npos && dot >= titleStart;
  if (dir != nullptr) {
    *dir = separator == UTF16String::npos ? UTF16String() : path.substr(0, separator);
  }
  if (title != nullptr) {
    *title = hasExtension ? path.substr(titleStart, dot - titleStart) : path.substr(titleStart);
  }
  if (ext != nullptr && hasExtension) *ext = path.substr(dot);
}

void BuildPathSpec(const UTF16String& dir, const UTF16String& name, UTF16String& out,
                   PathStyle style) {
  const UTF16Char separator = SeparatorOf(style);
  out = dir;
  if (!out.empty() && out.back() != separator) out.push_back(separator);
  out += name;
}

UTF16String GetPathFileName(const UTF16String& path, PathStyle style) {
  const std::size_t separator = path.rfind(SeparatorOf(style));
  if (separator == UTF16String::npos) return UTF16String();
  return path.substr(separator + 1);
}

bool GetParentPath(const UTF16String& path, UTF16String& out, PathStyle style) {
  const std::size_t separator = LastSeparator(path, style);
  if (separator == UTF16String::npos) return false;
  if (separator == 0) {
    if (style == PathStyle::kWindows || path.size() == 1) return false;
    out.assign(1, kSlash);
    return true;
  }
  UTF16String parent = path.substr(0, separator);
  // On POSIX a parent of "/" (from an unnormalised "//a") stays the root.
  const bool posixRoot = style == PathStyle::kPosix && parent.size() == 1;
  if (!parent.empty() && parent.back() == SeparatorOf(style) && !posixRoot) parent.pop_back();
  out = std::move(parent);
  return true;
}

}  // namespace kelcore::utility::FileUtils
