// The live map of one intern-table bucket: texts (length and bytes) to their records.
//
// Open addressing with linear probing over a power-of-two array of slots, each holding a
// record and the full 32-bit hash of its text, so that a probe compares bytes only when
// the hashes match. The array grows (doubling) before it is three-quarters full; removal
// shifts the following entries back, so no tombstones are left. Slot arrays come from
// the small-block allocator.
//
// Not thread-safe: the bucket's lock guards every call.
#pragma once

#include <kelcore/utility/ImmutableString.h>

#include <cstddef>
#include <cstdint>

namespace kelcore::utility {

class ImmutableStringMap {
 public:
  using Record = ImmutableString::InternalRepresentation;

  ImmutableStringMap() noexcept = default;
  ~ImmutableStringMap();
  ImmutableStringMap(const ImmutableStringMap&) = delete;
  ImmutableStringMap& operator=(const ImmutableStringMap&) = delete;

  // The hash that Find and Insert take.
  static std::uint32_t Hash(const unsigned char* text, std::size_t length) noexcept;

  // The record holding exactly these bytes, or null.
  Record* Find(const unsigned char* text, std::uint32_t length, std::uint32_t hash) const noexcept;
  // Makes room for one more record; throws std::bad_alloc (the map is then unchanged).
  void Reserve();
  // Adds a record whose text is not in the map yet. Reserve must have been called since
  // the last Insert.
  void Insert(Record* record, std::uint32_t hash) noexcept;
  // Removes `record`, which must be in the map.
  void Remove(Record* record) noexcept;

  // Calls `visit(record)` for every record, in no particular order.
  template <class Visit>
  void ForEach(Visit visit) const {
    for (std::size_t i = 0; i < capacity_; ++i) {
      if (slots_[i].record != nullptr) visit(slots_[i].record);
    }
  }
  std::size_t Size() const noexcept { return size_; }

 private:
  struct Slot {
    Record* record;
    std::uint32_t hash;
  };

  void Rehash(std::size_t capacity);

  Slot* slots_ = nullptr;
  std::size_t capacity_ = 0;  // 0 or a power of two
  std::size_t size_ = 0;
};

}  // namespace kelcore::utility
