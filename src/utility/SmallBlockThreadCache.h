// The per-thread front of the small-block allocator, owned by its thread, so that most
// allocations and disposals touch no shared memory. Per size class it keeps an active
// chain of free blocks, which requests pop and push, of at most BatchSize blocks, and
// one full chain in reserve:
//  - when the active chain is empty, it takes the reserve, or else a batch from the
//    class's shared lock-free list;
//  - when the active chain is full, the reserve (if any) goes to the shared list and
//    the active chain becomes the reserve.
// So the cache holds at most two batches per class, blocks move in whole batches, and no
// chain is ever walked. When the thread ends, every cached block goes back to the shared
// lists. Blocks keep no header in the cache either: the link sits in the first word.
//
// Only the owning thread touches a cache, except that GatherCachedBlocks reads the
// counters (relaxed atomics) of every live cache under the registry lock.
#pragma once

#include <array>
#include <atomic>
#include <cstdint>

#include "utility/SmallBlockBatches.h"
#include "utility/SmallBlockSizeClasses.h"

namespace kelcore::utility::smallblock {

// The active chain, read on every request. The counters are atomics only so that a
// snapshot on another thread may read them; the owner uses plain loads and stores.
struct CacheBin {
  FreeBlock* head = nullptr;
  std::atomic<std::uint32_t> room{0};  // BatchSize - blocks in the chain
};

struct ReserveChain {
  FreeBlock* head = nullptr;
  std::atomic<std::uint32_t> count{0};  // 0 when there is no reserve
};

struct ThreadCache {
  CacheBin bins[kClassCount];
  ReserveChain reserves[kClassCount];
  // Batch records kept at hand, so that moving batches rarely touches the shared spares.
  static constexpr std::uint32_t kMaxSpareRecords = 32;
  BatchIndex spareRecords[kMaxSpareRecords];
  std::uint32_t spareRecordCount = 0;
  ThreadCache* previous = nullptr;  // the registry of live caches
  ThreadCache* next = nullptr;
};

// A cache with empty chains, registered for snapshots; null when memory is exhausted.
ThreadCache* CreateThreadCache() noexcept;
// Returns every cached block and record to the shared lists and frees the cache.
void DestroyThreadCache(ThreadCache* cache) noexcept;

// Fills the empty active chain of class `cls` from the reserve or the shared list
// (growing the class if needed). Throws std::bad_alloc.
void RefillBin(ThreadCache& cache, std::uint8_t cls);
// Empties the full active chain of class `cls` into the reserve, first handing the
// reserve to the shared list. Returns false, changing nothing, if no batch record could
// be had (memory exhausted).
bool MakeRoom(ThreadCache& cache, std::uint8_t cls) noexcept;

// Adds, per class, the blocks held by every live cache; returns the number of caches.
std::uint64_t GatherCachedBlocks(std::array<std::uint64_t, kClassCount>& cached) noexcept;

}  // namespace kelcore::utility::smallblock
