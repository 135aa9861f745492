// Iterators over the contents of a directory: the files of one directory
// (Dir::FileIterator), its subdirectories or the mounted volumes (Dir::DirIterator), and
// every file of a tree (RecursiveFileIterator).
//
// Listing rules, shared by all of them:
//  - "." and ".." never appear. Hidden entries (names beginning with ".") appear only
//    when asked for.
//  - Entries come in natural order of their names, ignoring ASCII case ("file2" before
//    "File10"), names equal in that order by their UTF-16 code units, so the order is
//    total and the same on every run.
//  - A file is any entry that is not a directory: regular files, and also devices,
//    pipes, sockets and dangling symbolic links. Whether a symbolic link to a directory
//    counts as a directory is set per listing (see Dir::BeginFiles).
//  - The filter, when given, is called with the entry's name and full path (UTF-16) and
//    keeps the entry when it returns true.
//  - The abort query, when given, is copied into the iterator and called before every
//    entry is read from the system and before every step; when it returns true the
//    listing stops and the iterator becomes equal to the end iterator.
//  - A directory that does not exist or is not a directory throws
//    dir_not_found_exception; one that cannot be read (no permission) throws
//    dir_exception. Entries that vanish while the directory is read are skipped.
//
// Dir::FileIterator and Dir::DirIterator read the whole directory when they are made and
// then walk that snapshot: they are multi-pass forward iterators; copies step
// independently and share the snapshot (read-only, so copies may be used from different
// threads; the abort query is then called from each of them and must allow that). A
// default-constructed iterator is the end iterator.
//
// RecursiveFileIterator reads one directory at a time. Its copies share one position
// (stepping one steps all), so it is a single-pass input iterator; copies must not be
// used from different threads at once.
#pragma once

#include <boost/function.hpp>
#include <boost/shared_ptr.hpp>
#include <cstddef>
#include <iterator>

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::filesupport {

class File;
class Dir;

// Returns true to stop a listing.
using AbortQueryFunction = boost::function<bool()>;
// Called with (name, full path); returns true to keep the entry.
using NameFilterFunction = boost::function<bool(const UTF16String&, const UTF16String&)>;
using NameFilter = boost::shared_ptr<const NameFilterFunction>;

namespace detail {
template <class Entry>
class DirListing;
class RecursiveWalk;
}  // namespace detail

// Walks a snapshot of entries of type Entry (File or Dir).
template <class Entry>
class KELCORE_API DirSnapshotIterator {
 public:
  using iterator_category = std::forward_iterator_tag;
  using value_type = Entry;
  using difference_type = std::ptrdiff_t;
  using pointer = const Entry*;
  using reference = const Entry&;

  // The end iterator.
  DirSnapshotIterator() noexcept = default;
  // Starts at the first entry of `listing`; null or empty gives the end iterator.
  explicit DirSnapshotIterator(boost::shared_ptr<const detail::DirListing<Entry>> listing);

  // Dereferencing the end iterator throws std::out_of_range.
  const Entry& operator*() const;
  const Entry* operator->() const { return &**this; }

  DirSnapshotIterator& operator++();
  DirSnapshotIterator operator++(int);

  // Equal when both are at the end, or at the same entry of the same snapshot.
  bool operator==(const DirSnapshotIterator& other) const noexcept;

 private:
  boost::shared_ptr<const detail::DirListing<Entry>> listing_;
  std::size_t index_ = 0;
};

extern template class DirSnapshotIterator<File>;
extern template class DirSnapshotIterator<Dir>;

using DirFileIterator = DirSnapshotIterator<File>;
using DirSubdirIterator = DirSnapshotIterator<Dir>;

// Every file of a directory tree, depth first: the files of a directory, in listing
// order, then the tree of each of its subdirectories in listing order. Symbolic links to
// directories are never followed (so a link cycle cannot trap the walk); a link to a
// file is yielded like a file. The start directory must be readable (else the
// exceptions above); a subdirectory that cannot be read is skipped.
class KELCORE_API RecursiveFileIterator {
 public:
  using iterator_category = std::input_iterator_tag;
  using value_type = File;
  using difference_type = std::ptrdiff_t;
  using pointer = const File*;
  using reference = const File&;

  // The end iterator.
  RecursiveFileIterator() noexcept = default;
  // Starts the walk at the first file of the tree under `root`. `filter` applies to the
  // files only (every subdirectory is entered); hidden files and hidden directories are
  // included when `includeHidden` is true.
  explicit RecursiveFileIterator(const Dir& root, bool includeHidden = false,
                                 const NameFilter& filter = NameFilter());

  // Installs (or with an empty function removes) the abort query; it is called before
  // each directory entry is read and before each step. Shared by all copies.
  void SetAbortQueryCallback(const AbortQueryFunction& abortQuery);

  // The directory holding the current file. Throws std::out_of_range at the end.
  Dir CurrentDir() const;

  // Dereferencing the end iterator throws std::out_of_range.
  const File& operator*() const;
  const File* operator->() const { return &**this; }

  RecursiveFileIterator& operator++();
  // Steps the shared state, returning a copy of the current file.
  File operator++(int);

  // Equal when both are at the end, or when they share one walk.
  bool operator==(const RecursiveFileIterator& other) const noexcept;

 private:
  boost::shared_ptr<detail::RecursiveWalk> walk_;
};

}  // namespace kelcore::filesupport
