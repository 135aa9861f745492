// ImmutableString: a small handle to an interned, never-changing UTF-8 text.
//
// Equal texts share one representation, so copying a handle costs one atomic increment
// and equality of two handles is usually a pointer test. Texts are of two kinds:
//   - static: CreateStatic keeps the caller's pointer; the bytes must stay unchanged for
//     the rest of the process (literals). Static texts are never counted or freed.
//   - dynamic: the bytes are copied after the record and reference-counted.
// Whichever kind reaches the table first decides: CreateDynamic of a text that was made
// static returns the static representation, and CreateStatic of a text already made
// dynamic returns the counted one.
//
// Text is measured up to its NUL unless a length is given; a length may include embedded
// NUL bytes, which then take part in interning (the table compares whole lengths) but not
// in Compare (see there). UTF-16 arguments are converted to UTF-8 first. A text of length
// 0 gives the empty handle, which has no representation. A text that cannot be stored
// (no memory for its record or the table) also gives the empty handle; a text longer than
// 4 GiB - 64 bytes throws std::length_error. Null pointers count as empty texts.
//
// The intern table has 64 buckets, chosen by (last byte + byte at length*2/3 + length)
// mod 64. Each bucket has its own recursive lock, a live map from text to representation
// and an expired list of representations whose count reached zero. Representations stay
// in the live map when they expire, so creating the text again revives them;
// PurgeUnusedStrings frees those still unused. Nothing is freed otherwise.
//
// Threads. Any thread may create, copy, compare and drop handles at any time; a single
// handle object is not to be changed by one thread while another uses it (like int).
//   - Lookups, last drops and purges of a bucket's texts are serialised by its lock.
//   - Copying a handle of a dynamic text is one relaxed atomic increment.
//   - Dropping one that other handles still share is one compare-and-swap (release)
//     that lowers the count, never to zero. Only the last handle takes the bucket's
//     lock, lowers the count to zero under it (acquire-release: it sees every earlier
//     drop) and, unless the text is on the expired list already, puts it there.
//   - The count therefore reaches zero only under the bucket's lock, and leaves zero only
//     under it (a lookup revives the text there), so a purge that finds the count zero
//     under the lock frees a text that no thread can reach any more: the last dropper
//     has finished with it, no lookup can run, and no handle is left to copy. A text
//     that expires, revives and expires again is on the list once (a flag, guarded by
//     the lock, says it is there).
// Static texts need no synchronization after creation.
//
// Lifetime. The table is made on first use and destroyed at process exit, freeing every
// dynamic text that no handle holds. Dynamic texts still held then (by handles in static
// objects destroyed later) are freed by their last drop; texts created after that point
// are not interned (each creation makes a counted copy of its own). The records of static
// texts are kept, since handles that are not counted may still refer to them.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

#include <atomic>
#include <cstdint>
#include <string>
#include <utility>

namespace kelcore::utility {

class KELCORE_API ImmutableString {
 public:
  // The shared record of one text; allocated from the small-block allocator as
  // kHeaderSize bytes (static) or kHeaderSize + length + 1 bytes (dynamic: the copied
  // bytes and a terminating 0 follow the record). Read-only for clients.
  struct InternalRepresentation {
    std::atomic<std::uint32_t> referenceCount;  // dynamic texts only
    std::uint32_t length;
    const unsigned char* data;
    InternalRepresentation* nextExpired;  // the expired list's link; guarded by the lock
    bool dynamic;
    bool onExpiredList;   // guarded by the bucket's lock
    std::uint8_t bucket;  // index of the bucket that holds the text
  };
  static constexpr std::uint32_t kHeaderSize = sizeof(InternalRepresentation);

  // The empty text.
  ImmutableString() noexcept = default;
  // Refers to `representation` (taking a reference when it is dynamic); null gives the
  // empty handle.
  explicit ImmutableString(InternalRepresentation* representation) noexcept;
  ImmutableString(const ImmutableString& other) noexcept : ImmutableString(other.rep_) {}
  // Takes over the reference; `other` becomes empty.
  ImmutableString(ImmutableString&& other) noexcept
      : rep_(std::exchange(other.rep_, nullptr)),
        data_(std::exchange(other.data_, kEmptyText)),
        length_(std::exchange(other.length_, 0)) {}
  ImmutableString& operator=(ImmutableString other) noexcept {
    Swap(other);
    return *this;
  }
  ~ImmutableString() { Release(rep_); }

  void Swap(ImmutableString& other) noexcept {
    std::swap(rep_, other.rep_);
    std::swap(data_, other.data_);
    std::swap(length_, other.length_);
  }

  static ImmutableString CreateDynamic(const std::string& text);
  static ImmutableString CreateDynamic(const UTF8String& text);
  static ImmutableString CreateDynamic(const UTF16String& text);
  static ImmutableString CreateDynamic(const char* text);
  static ImmutableString CreateDynamic(const unsigned char* text);
  static ImmutableString CreateDynamic(const unsigned char* text, std::size_t length);
  static ImmutableString CreateDynamic(const UTF16Char* text);
  static ImmutableString CreateStatic(const char* text);
  static ImmutableString CreateStatic(const unsigned char* text);

  // < 0, 0 or > 0. Handles of one representation compare equal at once. An empty handle
  // is less than any non-empty text and equal to an empty (or null) one. Otherwise the
  // bytes are compared as by strncmp over the shorter length and a non-zero result is
  // returned as strncmp gave it; on a tie the shorter text is the smaller (-1 or 1).
  // Narrow and UTF-8 arguments, std::string ones included, are measured up to their
  // first NUL; UTF-16 ones are converted to UTF-8 (which stops at the first NUL unit).
  // As with strncmp, texts that differ only after an embedded 0 compare equal.
  int Compare(const ImmutableString& other) const noexcept;
  int Compare(const std::string& other) const noexcept;
  int Compare(const UTF8String& other) const noexcept;
  int Compare(const UTF16String& other) const;
  int Compare(const char* other) const noexcept;
  int Compare(const unsigned char* other) const noexcept;
  int Compare(const UTF16Char* other) const;

  // The text as UTF-16, converted up to its first 0 byte.
  UTF16String ToString() const;

  // The bytes (NUL-terminated for dynamic texts and literals; "" when empty), their
  // number, and the shared record (null when empty).
  const unsigned char* Data() const noexcept { return data_; }
  const char* CStr() const noexcept { return reinterpret_cast<const char*>(data_); }
  std::uint32_t Length() const noexcept { return length_; }
  bool IsEmpty() const noexcept { return length_ == 0; }
  InternalRepresentation* GetInternalRepresentation() const noexcept { return rep_; }

  // Frees every dynamic text that no handle holds; true when at least one was freed.
  static bool PurgeUnusedStrings();

  friend bool operator==(const ImmutableString& a, const ImmutableString& b) noexcept {
    return a.rep_ == b.rep_ || a.Compare(b) == 0;
  }
  friend bool operator<(const ImmutableString& a, const ImmutableString& b) noexcept {
    return a.Compare(b) < 0;
  }

 private:
  static const unsigned char kEmptyText[1];

  static ImmutableString LookupOrCreate(const unsigned char* text, std::size_t length,
                                        bool dynamic);
  // The last drop of a dynamic text: see Threads above.
  static void ReleaseLast(InternalRepresentation* representation) noexcept;

  static void Release(InternalRepresentation* rep) noexcept {
    if (rep == nullptr || !rep->dynamic) return;
    std::uint32_t count = rep->referenceCount.load(std::memory_order_relaxed);
    while (count > 1) {
      if (rep->referenceCount.compare_exchange_weak(count, count - 1, std::memory_order_release,
                                                    std::memory_order_relaxed)) {
        return;
      }
    }
    ReleaseLast(rep);
  }

  InternalRepresentation* rep_ = nullptr;
  const unsigned char* data_ = kEmptyText;
  std::uint32_t length_ = 0;
};

inline ImmutableString::ImmutableString(InternalRepresentation* representation) noexcept
    : rep_(representation) {
  if (rep_ != nullptr) {
    if (rep_->dynamic) rep_->referenceCount.fetch_add(1, std::memory_order_relaxed);
    data_ = rep_->data;
    length_ = rep_->length;
  }
}

}  // namespace kelcore::utility
