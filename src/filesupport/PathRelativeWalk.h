// The two walks between an absolute file and a normalised relative path, written over a
// directory model so that the same code serves Dir on this platform and, in the tests, a
// model of another platform's paths (Windows drives, where two paths can share no
// ancestor at all).
//
// A model M of a directory type D supplies, all const and free of side effects:
//   bool Same(const D&, const D&)     directory equality;
//   bool IsTop(const D&)              a top-level directory ("/", "C:", a UNC share);
//   bool Ascend(D& d)                 d becomes its parent and true is returned; false,
//                                     d unchanged, when there is no parent or the parent
//                                     would not be a shorter path (so every walk ends);
//   UTF16String Name(const D&)        the directory's own name (last component);
//   D Child(const D&, const UTF16String& name)   the subdirectory `name` of d.
#pragma once

#include <kelcore/utility/StringTypes.h>

#include <cstddef>
#include <vector>

namespace kelcore::filesupport::detail {

// The relative path, with '/' separators, from `base` to the file `fileName` in the
// directory `fileParent`; empty when the two have no common ancestor.
template <class D, class M>
UTF16String RelativePathOf(const D& fileParent, const UTF16String& fileName, const D& base,
                           const M& model) {
  if (model.Same(fileParent, base)) return fileName;

  // The file's ancestors, from its parent up to its top-level directory (bottom-up).
  std::vector<D> chain;
  D up = fileParent;
  for (;;) {
    chain.push_back(up);
    if (model.IsTop(up) || !model.Ascend(up)) break;
  }

  UTF16String result;
  D walk = base;
  std::size_t common = 0;
  for (;;) {
    bool found = false;
    for (std::size_t i = 0; i < chain.size(); ++i) {
      if (model.Same(chain[i], walk)) {
        common = i;
        found = true;
        break;
      }
    }
    if (found) break;
    result += u"../";
    if (model.IsTop(walk) || !model.Ascend(walk)) return UTF16String();
  }
  for (std::size_t i = common; i > 0; --i) {
    result += model.Name(chain[i - 1]);
    result += u'/';
  }
  result += fileName;
  return result;
}

// Where a relative path leads: the directory reached and the file name after the last
// '/' (empty when the path ends with '/').
template <class D>
struct RelativeWalkEnd {
  D dir;
  UTF16String name;
};

// Walks `relativePath` ('/' separators) from `base`: "." and empty components are
// skipped, ".." ascends (staying put where the model has no parent), any other
// component enters that subdirectory. The caller has checked that the path is relative.
template <class D, class M>
RelativeWalkEnd<D> WalkRelativePath(const UTF16String& relativePath, const D& base,
                                    const M& model) {
  D dir = base;
  std::size_t start = 0;
  for (;;) {
    const std::size_t slash = relativePath.find(u'/', start);
    if (slash == UTF16String::npos) break;
    const UTF16String component = relativePath.substr(start, slash - start);
    if (component == u"..") {
      model.Ascend(dir);
    } else if (!component.empty() && component != u".") {
      dir = model.Child(dir, component);
    }
    start = slash + 1;
  }
  return RelativeWalkEnd<D>{dir, relativePath.substr(start)};
}

}  // namespace kelcore::filesupport::detail
