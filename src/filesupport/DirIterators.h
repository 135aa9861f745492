// The state behind the directory iterators: snapshots of one directory's entries and the
// walk of a tree. Internal to the library.
#pragma once

#include <cstddef>
#include <vector>

#include <kelcore/filesupport/Dir.h>
#include <kelcore/filesupport/DirIterators.h>
#include <kelcore/filesupport/File.h>

namespace kelcore::filesupport::detail {

// The entries a snapshot iterator walks, and the abort query it calls at each step.
// Immutable once built, so shared by iterator copies on any thread.
template <class Entry>
class DirListing {
 public:
  std::vector<Entry> entries;
  AbortQueryFunction abortQuery;
};

// One entry of a directory as the system reports it.
struct DirEntryInfo {
  UTF16String name;
  bool isDirectory = false;        // a directory itself, not a link to one
  bool isSymlink = false;          // a symbolic link
  bool targetIsDirectory = false;  // a directory once symbolic links are followed
};

// The entries of `dir` ("." and ".." left out; hidden names only with `includeHidden`),
// sorted in the listing order. Calls `abortQuery` (when set) before every entry is read;
// returns false as soon as it returns true. A missing directory, or a path that is not a
// directory, throws dir_not_found_exception; any other failure dir_exception.
bool ReadSortedEntries(const Dir& dir, bool includeHidden, const AbortQueryFunction& abortQuery,
                       std::vector<DirEntryInfo>& entries);

// The depth-first walk behind RecursiveFileIterator.
class RecursiveWalk {
 public:
  // Reads the root; throws as ReadSortedEntries.
  RecursiveWalk(const Dir& root, bool includeHidden, const NameFilter& filter);

  bool AtEnd() const noexcept { return stack_.empty(); }
  // Only when !AtEnd().
  const File& Current() const { return stack_.back().files[stack_.back().nextFile]; }
  const Dir& CurrentDir() const { return stack_.back().dir; }

  void Step();
  void SetAbortQuery(const AbortQueryFunction& abortQuery) { abortQuery_ = abortQuery; }

 private:
  struct Frame {
    Dir dir;
    std::vector<File> files;
    std::size_t nextFile = 0;
    std::vector<Dir> subdirs;
    std::size_t nextSubdir = 0;
  };

  // Fills `frame` from its directory; false when the abort query stopped the reading.
  bool Load(Frame& frame);
  bool Aborted() const { return abortQuery_ && abortQuery_(); }
  // Moves from the current position to the next file, descending and climbing as needed.
  void Settle();

  bool includeHidden_;
  NameFilter filter_;
  AbortQueryFunction abortQuery_;
  std::vector<Frame> stack_;
};

}  // namespace kelcore::filesupport::detail
