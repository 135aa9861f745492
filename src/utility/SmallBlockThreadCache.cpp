#include "utility/SmallBlockThreadCache.h"

#include <mutex>
#include <new>

#include "utility/SmallBlockGlobal.h"
#include "utility/SmallBlockPools.h"

namespace kelcore::utility::smallblock {
namespace {

struct Registry {
  std::mutex lock;
  ThreadCache* first = nullptr;
};

constinit Global<Registry> gRegistry;

// Caches themselves are blocks of the allocator.
constexpr std::uint8_t kCacheClass = kSizeTable[sizeof(ThreadCache)];
static_assert(sizeof(ThreadCache) <= kMaxSmallSize);

bool TakeRecord(ThreadCache& cache, BatchIndex& index) noexcept {
  if (cache.spareRecordCount == 0) return AcquireBatch(index);
  index = cache.spareRecords[--cache.spareRecordCount];
  return true;
}

void KeepRecord(ThreadCache& cache, BatchIndex index) noexcept {
  if (cache.spareRecordCount == ThreadCache::kMaxSpareRecords) {
    ReleaseBatch(index);
  } else {
    cache.spareRecords[cache.spareRecordCount++] = index;
  }
}

// Hands a null-terminated chain of `count` blocks to the class's shared list.
bool GiveChain(ThreadCache& cache, std::uint8_t cls, FreeBlock* head,
               std::uint32_t count) noexcept {
  BatchIndex index;
  if (!TakeRecord(cache, index)) return false;
  Batch& batch = BatchAt(index);
  batch.head = head;
  batch.count = count;
  GiveBatch(cls, index);
  return true;
}

std::uint32_t ActiveCount(const ThreadCache& cache, std::uint8_t cls) noexcept {
  return BatchSize(kClasses[cls]) - cache.bins[cls].room.load(std::memory_order_relaxed);
}

}  // namespace

ThreadCache* CreateThreadCache() noexcept {
  void* memory;
  try {
    memory = TakeBlock(kCacheClass);
  } catch (const std::bad_alloc&) {
    return nullptr;
  }
  auto* cache = ::new (memory) ThreadCache;
  for (std::uint8_t cls = 0; cls < kClassCount; ++cls) {
    cache->bins[cls].room.store(BatchSize(kClasses[cls]), std::memory_order_relaxed);
  }
  Registry& registry = *gRegistry;
  std::lock_guard lock(registry.lock);
  cache->next = registry.first;
  if (registry.first != nullptr) registry.first->previous = cache;
  registry.first = cache;
  return cache;
}

void DestroyThreadCache(ThreadCache* cache) noexcept {
  {
    Registry& registry = *gRegistry;
    std::lock_guard lock(registry.lock);
    if (cache->previous != nullptr) {
      cache->previous->next = cache->next;
    } else {
      registry.first = cache->next;
    }
    if (cache->next != nullptr) cache->next->previous = cache->previous;
  }
  // Without a record (memory exhausted) a chain stays out of circulation.
  for (std::uint8_t cls = 0; cls < kClassCount; ++cls) {
    if (const std::uint32_t active = ActiveCount(*cache, cls); active != 0) {
      GiveChain(*cache, cls, cache->bins[cls].head, active);
    }
    const ReserveChain& reserve = cache->reserves[cls];
    if (const std::uint32_t reserved = reserve.count.load(std::memory_order_relaxed)) {
      GiveChain(*cache, cls, reserve.head, reserved);
    }
  }
  while (cache->spareRecordCount != 0) {
    ReleaseBatch(cache->spareRecords[--cache->spareRecordCount]);
  }
  cache->~ThreadCache();
  GiveBlock(kCacheClass, cache);
}

void RefillBin(ThreadCache& cache, std::uint8_t cls) {
  CacheBin& bin = cache.bins[cls];
  ReserveChain& reserve = cache.reserves[cls];
  const std::uint32_t perBatch = BatchSize(kClasses[cls]);
  if (const std::uint32_t reserved = reserve.count.load(std::memory_order_relaxed)) {
    bin.head = reserve.head;
    bin.room.store(perBatch - reserved, std::memory_order_relaxed);
    reserve.head = nullptr;
    reserve.count.store(0, std::memory_order_relaxed);
    return;
  }
  const BatchIndex index = TakeBatch(cls);
  const Batch& batch = BatchAt(index);
  bin.head = batch.head;
  bin.room.store(perBatch - batch.count, std::memory_order_relaxed);
  KeepRecord(cache, index);
}

bool MakeRoom(ThreadCache& cache, std::uint8_t cls) noexcept {
  CacheBin& bin = cache.bins[cls];
  ReserveChain& reserve = cache.reserves[cls];
  const std::uint32_t reserved = reserve.count.load(std::memory_order_relaxed);
  if (reserved != 0 && !GiveChain(cache, cls, reserve.head, reserved)) return false;
  reserve.head = bin.head;
  reserve.count.store(ActiveCount(cache, cls), std::memory_order_relaxed);
  bin.head = nullptr;
  bin.room.store(BatchSize(kClasses[cls]), std::memory_order_relaxed);
  return true;
}

std::uint64_t GatherCachedBlocks(std::array<std::uint64_t, kClassCount>& cached) noexcept {
  Registry& registry = *gRegistry;
  std::lock_guard lock(registry.lock);
  std::uint64_t caches = 0;
  for (const ThreadCache* cache = registry.first; cache != nullptr; cache = cache->next) {
    ++caches;
    for (std::uint8_t cls = 0; cls < kClassCount; ++cls) {
      cached[cls] +=
          ActiveCount(*cache, cls) + cache->reserves[cls].count.load(std::memory_order_relaxed);
    }
  }
  return caches;
}

}  // namespace kelcore::utility::smallblock
