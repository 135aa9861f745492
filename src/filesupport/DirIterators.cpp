#include "filesupport/DirIterators.h"

#include <algorithm>
#include <stdexcept>

#include <kelcore/filesupport/FileExceptions.h>
#include <kelcore/utility/NaturalCompare.h>

#include "filesupport/FileHelper.h"

namespace kelcore::filesupport {

namespace {

// 0 on success, else the system error code; `aborted` tells whether the abort query
// stopped the reading. Entries are left unsorted, "." and ".." already removed.
unsigned long ReadDirectory(const UTF16String& nativePath, const AbortQueryFunction& abortQuery,
                            std::vector<detail::DirEntryInfo>& entries, bool& aborted);

bool ListingOrder(const detail::DirEntryInfo& a, const detail::DirEntryInfo& b) {
  const long order = utility::CaseInsensitive::NaturalStringCompare(a.name, b.name);
  return order != 0 ? order < 0 : a.name < b.name;
}

bool IsHidden(const UTF16String& name) {
  return !name.empty() && name[0] == UTF16Char('.');
}

bool Keep(const NameFilter& filter, const UTF16String& name, const UTF16String& path) {
  return !filter || !*filter || (*filter)(name, path);
}

}  // namespace

namespace detail {

bool ReadSortedEntries(const Dir& dir, bool includeHidden, const AbortQueryFunction& abortQuery,
                       std::vector<DirEntryInfo>& entries) {
  entries.clear();
  bool aborted = false;
  const unsigned long code =
      ReadDirectory(dir.Helper().FullNativePath(), abortQuery, entries, aborted);
  if (code == kErrorFileNotFound || code == kErrorPathNotFound) {
    throw dir_not_found_exception(dir);
  }
  if (code != 0) throw dir_exception(dir);
  if (aborted) return false;
  if (!includeHidden) {
    std::erase_if(entries, [](const DirEntryInfo& entry) { return IsHidden(entry.name); });
  }
  std::sort(entries.begin(), entries.end(), ListingOrder);
  return true;
}

RecursiveWalk::RecursiveWalk(const Dir& root, bool includeHidden, const NameFilter& filter)
    : includeHidden_(includeHidden), filter_(filter) {
  Frame frame;
  frame.dir = root;
  Load(frame);  // the walk has no abort query yet
  stack_.push_back(std::move(frame));
  Settle();
}

bool RecursiveWalk::Load(Frame& frame) {
  std::vector<DirEntryInfo> entries;
  if (!ReadSortedEntries(frame.dir, includeHidden_, abortQuery_, entries)) return false;
  for (const DirEntryInfo& entry : entries) {
    if (entry.isDirectory) {
      frame.subdirs.emplace_back(frame.dir, entry.name);
    } else if (!entry.targetIsDirectory) {
      File file(frame.dir, entry.name);
      if (Keep(filter_, entry.name, file.FullPath())) frame.files.push_back(std::move(file));
    }
  }
  return true;
}

void RecursiveWalk::Settle() {
  while (!stack_.empty()) {
    Frame& top = stack_.back();
    if (top.nextFile < top.files.size()) return;
    if (top.nextSubdir == top.subdirs.size()) {
      stack_.pop_back();
      continue;
    }
    Frame child;
    child.dir = top.subdirs[top.nextSubdir++];
    try {
      if (!Load(child)) {
        stack_.clear();
        return;
      }
    } catch (const dir_exception&) {
      continue;  // unreadable or vanished: skipped
    }
    stack_.push_back(std::move(child));
  }
}

void RecursiveWalk::Step() {
  if (stack_.empty()) return;
  if (Aborted()) {
    stack_.clear();
    return;
  }
  ++stack_.back().nextFile;
  Settle();
}

}  // namespace detail

// Snapshot iterators.

template <class Entry>
DirSnapshotIterator<Entry>::DirSnapshotIterator(
    boost::shared_ptr<const detail::DirListing<Entry>> listing)
    : listing_(std::move(listing)) {
  if (listing_ && listing_->entries.empty()) listing_.reset();
}

template <class Entry>
const Entry& DirSnapshotIterator<Entry>::operator*() const {
  if (!listing_) throw std::out_of_range("dereferencing the end of a directory listing");
  return listing_->entries[index_];
}

template <class Entry>
DirSnapshotIterator<Entry>& DirSnapshotIterator<Entry>::operator++() {
  if (!listing_) return *this;
  if ((listing_->abortQuery && listing_->abortQuery()) || ++index_ == listing_->entries.size()) {
    listing_.reset();
    index_ = 0;
  }
  return *this;
}

template <class Entry>
DirSnapshotIterator<Entry> DirSnapshotIterator<Entry>::operator++(int) {
  DirSnapshotIterator previous = *this;
  ++*this;
  return previous;
}

template <class Entry>
bool DirSnapshotIterator<Entry>::operator==(const DirSnapshotIterator& other) const noexcept {
  return listing_ == other.listing_ && index_ == other.index_;
}

template class DirSnapshotIterator<File>;
template class DirSnapshotIterator<Dir>;

Dir::FileIterator Dir::BeginFiles(bool includeHidden, const AbortQueryFunction* abortQuery,
                                  bool followLinks, const NameFilter& filter) const {
  auto listing = boost::shared_ptr<detail::DirListing<File>>(new detail::DirListing<File>);
  if (abortQuery != nullptr) listing->abortQuery = *abortQuery;
  std::vector<detail::DirEntryInfo> entries;
  if (!detail::ReadSortedEntries(*this, includeHidden, listing->abortQuery, entries)) {
    return FileIterator();
  }
  for (const detail::DirEntryInfo& entry : entries) {
    const bool isFile = followLinks ? !entry.targetIsDirectory : !entry.isDirectory;
    if (!isFile) continue;
    File file(*this, entry.name);
    if (Keep(filter, entry.name, file.FullPath())) listing->entries.push_back(std::move(file));
  }
  return FileIterator(listing);
}

Dir::DirIterator Dir::BeginSubdirs(bool includeHidden, const AbortQueryFunction* abortQuery,
                                   const NameFilter& filter) const {
  auto listing = boost::shared_ptr<detail::DirListing<Dir>>(new detail::DirListing<Dir>);
  if (abortQuery != nullptr) listing->abortQuery = *abortQuery;
  std::vector<detail::DirEntryInfo> entries;
  if (!detail::ReadSortedEntries(*this, includeHidden, listing->abortQuery, entries)) {
    return DirIterator();
  }
  for (const detail::DirEntryInfo& entry : entries) {
    if (!entry.targetIsDirectory) continue;
    Dir dir(*this, entry.name);
    if (Keep(filter, entry.name, dir.FullPath())) listing->entries.push_back(std::move(dir));
  }
  return DirIterator(listing);
}

// Recursive iterator.

RecursiveFileIterator::RecursiveFileIterator(const Dir& root, bool includeHidden,
                                             const NameFilter& filter)
    : walk_(new detail::RecursiveWalk(root, includeHidden, filter)) {}

void RecursiveFileIterator::SetAbortQueryCallback(const AbortQueryFunction& abortQuery) {
  if (walk_) walk_->SetAbortQuery(abortQuery);
}

Dir RecursiveFileIterator::CurrentDir() const {
  if (!walk_ || walk_->AtEnd()) throw std::out_of_range("the recursive walk is at its end");
  return walk_->CurrentDir();
}

const File& RecursiveFileIterator::operator*() const {
  if (!walk_ || walk_->AtEnd()) throw std::out_of_range("the recursive walk is at its end");
  return walk_->Current();
}

RecursiveFileIterator& RecursiveFileIterator::operator++() {
  if (walk_) walk_->Step();
  return *this;
}

File RecursiveFileIterator::operator++(int) {
  File current = **this;
  ++*this;
  return current;
}

bool RecursiveFileIterator::operator==(const RecursiveFileIterator& other) const noexcept {
  const bool atEnd = !walk_ || walk_->AtEnd();
  const bool otherAtEnd = !other.walk_ || other.walk_->AtEnd();
  if (atEnd || otherAtEnd) return atEnd == otherAtEnd;
  return walk_ == other.walk_;
}

}  // namespace kelcore::filesupport

#if defined(_WIN32)
#include "win/DirIterators.inc"
#else
#include "posix/DirIterators.inc"
#endif
