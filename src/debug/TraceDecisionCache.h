// A lock-free cache of the inputs of TraceEnabled decisions, per category name, so that
// the common test needs no lock.
//
// Each entry remembers, for one category, what the locked test saw: the master's switch
// and volume in effect, whether the category was stored, and its switch and volume. It
// is stamped with the trace manager's epoch, a 64-bit counter that the manager raises,
// under its lock, after every change of anything a decision depends on (stored changes,
// merges, shut-down, loading); it never wraps, so a stamp never matches by accident.
//
// Memory ordering. Entries are written only under the trace manager's lock (one writer
// at a time), readers take no lock. An entry is a sequence lock without fences: the
// writer makes its sequence odd, stores the fields with release, then makes the sequence
// even with a release store; a reader loads the sequence with acquire, the fields with
// acquire, then the sequence again, and uses the fields only when both loads saw the
// same even value. A reader that sees any field of a write in progress therefore sees
// that write's odd sequence (or a later value) on its second load, and a reader whose
// first load saw the even value sees every field of that write.
// The name table is append-only: a slot goes from null to an entry once (release store,
// acquire load) and entries live as long as the cache.
//
// In front of the name table sits a table indexed by the address of the caller's name,
// since callers mostly pass the same literal again and again: a hit there is verified by
// comparing the names (the text at an address may have changed), which is cheaper than
// hashing the name. Any thread may store an entry there (release; readers acquire):
// entries never die, and a wrong or overwritten hint only costs the name-table lookup.
//
// Why a hit is never stale: the reader loads the epoch with acquire before the entry. A
// setter that returned before the reader began raised the epoch before returning, so the
// reader sees that value or a later one; an entry stamped with it was computed under the
// lock after that raise, hence after the setter's change.
#pragma once

#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <memory>

namespace kelcore::debug {

struct TraceDecisionInputs {
  bool masterEnabled;
  std::int32_t masterVolume;
  bool stored;  // the category was in the database
  bool enabled;
  std::int32_t volume;
};

class TraceDecisionCache {
 public:
  TraceDecisionCache() = default;
  ~TraceDecisionCache();
  TraceDecisionCache(const TraceDecisionCache&) = delete;
  TraceDecisionCache& operator=(const TraceDecisionCache&) = delete;

  // Any thread, no lock: true, with `inputs` filled, when an entry for the NUL-terminated
  // `category` is stamped with `epoch` and was read consistently.
  bool Find(const unsigned char* category, std::uint64_t epoch,
            TraceDecisionInputs& inputs) const noexcept;
  // Under the trace manager's lock only. Records `inputs` for `category` stamped with
  // `epoch`. When the table is full the category is simply not cached. May throw
  // std::bad_alloc (a new entry), leaving the cache as it was.
  void Store(const unsigned char* category, std::uint64_t epoch, const TraceDecisionInputs& inputs);

 private:
  struct Entry;
  static constexpr std::size_t kSlots = 1024;  // a power of two
  static constexpr std::size_t kMaxProbes = 32;
  static constexpr std::size_t kAddressSlots = 256;  // a power of two, at most 256

  const Entry* Lookup(const unsigned char* category, std::size_t& length, std::uint64_t& hash,
                      std::size_t& freeSlot) const noexcept;
  static std::size_t AddressSlot(const unsigned char* category) noexcept;
  // Whether the NUL-terminated `category` is the entry's name.
  static bool Names(const Entry& entry, const unsigned char* category) noexcept;

  std::array<std::atomic<Entry*>, kSlots> slots_{};
  mutable std::array<std::atomic<const Entry*>, kAddressSlots> addressSlots_{};
};

}  // namespace kelcore::debug
