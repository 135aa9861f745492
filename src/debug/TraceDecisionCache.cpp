#include "debug/TraceDecisionCache.h"

#include <cstring>

namespace kelcore::debug {

struct TraceDecisionCache::Entry {
  Entry(const unsigned char* category, std::size_t length, std::uint64_t hashValue)
      : hash(hashValue), nameLength(length), name(new unsigned char[length]) {
    std::memcpy(name.get(), category, length);
  }

  const std::uint64_t hash;
  const std::size_t nameLength;
  const std::unique_ptr<unsigned char[]> name;

  std::atomic<std::uint64_t> sequence{0};
  std::atomic<std::uint64_t> epoch{0};
  std::atomic<std::uint32_t> flags{0};
  std::atomic<std::int32_t> masterVolume{0};
  std::atomic<std::int32_t> volume{0};
};

namespace {

constexpr std::uint32_t kMasterEnabled = 1;
constexpr std::uint32_t kStored = 2;
constexpr std::uint32_t kEnabled = 4;

}  // namespace

TraceDecisionCache::~TraceDecisionCache() {
  for (auto& slot : slots_) delete slot.load(std::memory_order_relaxed);
}

const TraceDecisionCache::Entry* TraceDecisionCache::Lookup(const unsigned char* category,
                                                            std::size_t& length,
                                                            std::uint64_t& hash,
                                                            std::size_t& freeSlot) const noexcept {
  // FNV-1a, measuring the name on the way.
  std::uint64_t h = 14695981039346656037ull;
  const unsigned char* p = category;
  for (; *p != 0; ++p) h = (h ^ *p) * 1099511628211ull;
  length = static_cast<std::size_t>(p - category);
  hash = h;
  freeSlot = kSlots;
  for (std::size_t probe = 0; probe < kMaxProbes; ++probe) {
    const std::size_t index = (h + probe) & (kSlots - 1);
    const Entry* entry = slots_[index].load(std::memory_order_acquire);
    if (entry == nullptr) {
      freeSlot = index;
      return nullptr;
    }
    if (entry->hash == h && entry->nameLength == length &&
        std::memcmp(entry->name.get(), category, length) == 0) {
      return entry;
    }
  }
  return nullptr;
}

std::size_t TraceDecisionCache::AddressSlot(const unsigned char* category) noexcept {
  // Fibonacci hashing of the address: neighbouring literals land in different slots.
  const auto address = static_cast<std::uint64_t>(reinterpret_cast<std::uintptr_t>(category));
  return static_cast<std::size_t>((address * 0x9E3779B97F4A7C15ull) >> 56) & (kAddressSlots - 1);
}

bool TraceDecisionCache::Names(const Entry& entry, const unsigned char* category) noexcept {
  // strncmp stops at the caller's NUL, so a shorter name is never read past its end;
  // equal over the entry's length, the caller's name must end right there.
  return std::strncmp(reinterpret_cast<const char*>(category),
                      reinterpret_cast<const char*>(entry.name.get()), entry.nameLength) == 0 &&
         category[entry.nameLength] == 0;
}

bool TraceDecisionCache::Find(const unsigned char* category, std::uint64_t epoch,
                              TraceDecisionInputs& inputs) const noexcept {
  std::atomic<const Entry*>& byAddress = addressSlots_[AddressSlot(category)];
  const Entry* entry = byAddress.load(std::memory_order_acquire);
  if (entry == nullptr || !Names(*entry, category)) {
    std::size_t length;
    std::uint64_t hash;
    std::size_t freeSlot;
    entry = Lookup(category, length, hash, freeSlot);
    if (entry == nullptr) return false;
    byAddress.store(entry, std::memory_order_release);
  }
  const std::uint64_t before = entry->sequence.load(std::memory_order_acquire);
  if ((before & 1) != 0) return false;
  // Acquire loads keep the second sequence load after them.
  const std::uint64_t stamp = entry->epoch.load(std::memory_order_acquire);
  const std::uint32_t flags = entry->flags.load(std::memory_order_acquire);
  inputs.masterVolume = entry->masterVolume.load(std::memory_order_acquire);
  inputs.volume = entry->volume.load(std::memory_order_acquire);
  if (entry->sequence.load(std::memory_order_relaxed) != before) return false;
  if (stamp != epoch) return false;
  inputs.masterEnabled = (flags & kMasterEnabled) != 0;
  inputs.stored = (flags & kStored) != 0;
  inputs.enabled = (flags & kEnabled) != 0;
  return true;
}

void TraceDecisionCache::Store(const unsigned char* category, std::uint64_t epoch,
                               const TraceDecisionInputs& inputs) {
  std::size_t length;
  std::uint64_t hash;
  std::size_t freeSlot;
  Entry* entry = const_cast<Entry*>(Lookup(category, length, hash, freeSlot));
  const bool fresh = entry == nullptr;
  if (fresh) {
    if (freeSlot == kSlots) return;
    entry = new Entry(category, length, hash);
  }
  const std::uint64_t sequence = entry->sequence.load(std::memory_order_relaxed);
  entry->sequence.store(sequence + 1, std::memory_order_relaxed);
  // Release stores: a reader that sees any new field sees the odd sequence before it.
  entry->epoch.store(epoch, std::memory_order_release);
  entry->flags.store((inputs.masterEnabled ? kMasterEnabled : 0) | (inputs.stored ? kStored : 0) |
                         (inputs.enabled ? kEnabled : 0),
                     std::memory_order_release);
  entry->masterVolume.store(inputs.masterVolume, std::memory_order_release);
  entry->volume.store(inputs.volume, std::memory_order_release);
  entry->sequence.store(sequence + 2, std::memory_order_release);
  if (fresh) slots_[freeSlot].store(entry, std::memory_order_release);
}

}  // namespace kelcore::debug
