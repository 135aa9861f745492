#include "utility/ImmutableStringMap.h"

#include <kelcore/utility/SmallBlockAllocator.h>

#include <cstring>
#include <new>

namespace kelcore::utility {

namespace {

constexpr std::size_t kFirstCapacity = 16;

std::uint64_t Load64(const unsigned char* bytes) noexcept {
  std::uint64_t word;
  std::memcpy(&word, bytes, sizeof word);
  return word;
}

std::uint64_t Mix(std::uint64_t a, std::uint64_t b) noexcept {
  a *= b;
  return a ^ (a >> 29);
}

}  // namespace

ImmutableStringMap::~ImmutableStringMap() {
  SmallBlockAllocator::Dispose(slots_, static_cast<unsigned int>(capacity_ * sizeof(Slot)));
}

// Eight bytes at a time through a multiply and shift; the tail is read as one
// zero-padded word. Only needs to spread texts of one bucket over its slots.
std::uint32_t ImmutableStringMap::Hash(const unsigned char* text, std::size_t length) noexcept {
  constexpr std::uint64_t kSeed = 0x9e3779b97f4a7c15ULL;
  constexpr std::uint64_t kMultiplier = 0xbf58476d1ce4e5b9ULL;
  std::uint64_t h = kSeed ^ length;
  std::size_t i = 0;
  for (; i + 8 <= length; i += 8) h = Mix(h ^ Load64(text + i), kMultiplier);
  if (i < length) {
    std::uint64_t tail = 0;
    std::memcpy(&tail, text + i, length - i);
    h = Mix(h ^ tail, kMultiplier);
  }
  h = Mix(h, kSeed);
  return static_cast<std::uint32_t>(h ^ (h >> 32));
}

ImmutableStringMap::Record* ImmutableStringMap::Find(const unsigned char* text,
                                                     std::uint32_t length,
                                                     std::uint32_t hash) const noexcept {
  if (capacity_ == 0) return nullptr;
  const std::size_t mask = capacity_ - 1;
  for (std::size_t i = hash & mask;; i = (i + 1) & mask) {
    const Slot& slot = slots_[i];
    if (slot.record == nullptr) return nullptr;
    if (slot.hash == hash && slot.record->length == length &&
        std::memcmp(slot.record->data, text, length) == 0) {
      return slot.record;
    }
  }
}

void ImmutableStringMap::Reserve() {
  if (capacity_ == 0) {
    Rehash(kFirstCapacity);
  } else if ((size_ + 1) * 4 > capacity_ * 3) {
    if (capacity_ > (std::size_t{1} << 26)) throw std::bad_alloc();
    Rehash(capacity_ * 2);
  }
}

void ImmutableStringMap::Insert(Record* record, std::uint32_t hash) noexcept {
  const std::size_t mask = capacity_ - 1;
  std::size_t i = hash & mask;
  while (slots_[i].record != nullptr) i = (i + 1) & mask;
  slots_[i] = Slot{record, hash};
  ++size_;
}

void ImmutableStringMap::Remove(Record* record) noexcept {
  const std::size_t mask = capacity_ - 1;
  std::size_t hole = Hash(record->data, record->length) & mask;
  while (slots_[hole].record != record) hole = (hole + 1) & mask;
  // Backward shift: move up every later entry of the run whose home is not between the
  // hole and itself, so that each stays reachable from its home slot.
  for (std::size_t next = (hole + 1) & mask; slots_[next].record != nullptr;
       next = (next + 1) & mask) {
    const std::size_t home = slots_[next].hash & mask;
    const bool homeInGap =
        hole <= next ? (home > hole && home <= next) : (home > hole || home <= next);
    if (homeInGap) continue;
    slots_[hole] = slots_[next];
    hole = next;
  }
  slots_[hole] = Slot{nullptr, 0};
  --size_;
}

void ImmutableStringMap::Rehash(std::size_t capacity) {
  auto* slots = static_cast<Slot*>(
      SmallBlockAllocator::Allocate(static_cast<unsigned int>(capacity * sizeof(Slot))));
  for (std::size_t i = 0; i < capacity; ++i) slots[i] = Slot{nullptr, 0};
  Slot* old = slots_;
  const std::size_t oldCapacity = capacity_;
  slots_ = slots;
  capacity_ = capacity;
  size_ = 0;
  for (std::size_t i = 0; i < oldCapacity; ++i) {
    if (old[i].record != nullptr) Insert(old[i].record, old[i].hash);
  }
  SmallBlockAllocator::Dispose(old, static_cast<unsigned int>(oldCapacity * sizeof(Slot)));
}

}  // namespace kelcore::utility
