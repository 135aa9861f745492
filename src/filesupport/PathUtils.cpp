#include <kelcore/filesupport/PathUtils.h>

#include <kelcore/filesupport/Dir.h>
#include <kelcore/filesupport/File.h>
#include <kelcore/utility/CaseMapping.h>

#include "filesupport/PathLongForm.h"
#include "filesupport/PathRelativeWalk.h"

#if defined(_WIN32)
#include "win/PathFileNameCollator.inc"
#else
#include "posix/PathFileNameCollator.inc"
#endif

namespace kelcore::filesupport {
namespace {

// Dir as the model of the relative-path walks.
struct DirModel {
  bool Same(const Dir& a, const Dir& b) const { return a == b; }
  bool IsTop(const Dir& d) const { return d.IsTopLevelDir(); }
  bool Ascend(Dir& d) const {
    if (d.IsTopLevelDir()) return false;
    Dir parent = d.Parent();
    if (parent.FullPath().size() >= d.FullPath().size()) return false;
    d = parent;
    return true;
  }
  UTF16String Name(const Dir& d) const { return d.GetName(); }
  Dir Child(const Dir& d, const UTF16String& name) const { return Dir(d, name); }
};

}  // namespace

UTF16String PrepAsLongPathName(const UTF16String& path) {
#if defined(_WIN32)
  return detail::WindowsLongPathName(path);
#else
  return path;
#endif
}

int CompareFileNames(const UTF16String& a, const UTF16String& b) {
  int order = 0;
  if (CompareFileNamesWithCollator(a, b, order)) return order;
  const int folded = utility::FoldCase(a).compare(utility::FoldCase(b));
  return folded < 0 ? -1 : (folded > 0 ? 1 : 0);
}

bool IsPathDriveLetter(const UTF16String& path) {
  return path.size() == 2 && path[1] == u':';
}

bool IsNormalizedRelativePath(const UTF16String& path) {
  if (path.empty() || path[0] == u'/' || path[0] == u'\\') return false;
  return !(path.size() >= 2 && path[1] == u':');
}

UTF16String MakeNormalizedRelativePath(const File& file, const Dir& base) {
  return detail::RelativePathOf(file.Parent(), file.GetName(), base, DirModel());
}

UTF16String MakeNormalizedRelativePath(const File& file, const File& baseFile) {
  return MakeNormalizedRelativePath(file, baseFile.Parent());
}

File MakeFileFromPath(const UTF16String& path, const Dir& base) {
  if (!IsNormalizedRelativePath(path)) return File(path);
  const detail::RelativeWalkEnd<Dir> end = detail::WalkRelativePath(path, base, DirModel());
  if (end.name.empty()) return File();
  return File(end.dir, end.name);
}

File MakeFileFromPath(const UTF16String& path, const File& baseFile) {
  return MakeFileFromPath(path, baseFile.Parent());
}

}  // namespace kelcore::filesupport
