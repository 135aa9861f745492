#include <kelcore/utility/SmallBlockAllocator.h>

#include <array>
#include <atomic>
#include <cstdlib>
#include <cstring>

#include "utility/SmallBlockPools.h"
#include "utility/SmallBlockSizeClasses.h"
#include "utility/SmallBlockSystemMemory.h"
#include "utility/SmallBlockThreadCache.h"

// The thread's cache pointer is read on every allocation: in a shared library the
// initial-exec model reads it straight off the thread pointer instead of calling the
// dynamic TLS resolver. It costs 16 bytes of the static TLS block.
#if defined(__ELF__)
#define KELCORE_INITIAL_EXEC_TLS __attribute__((tls_model("initial-exec")))
#else
#define KELCORE_INITIAL_EXEC_TLS
#endif

namespace kelcore::utility::smallblock {
namespace {

static_assert(SmallBlockAllocator::Metrics::kClassCount == kClassCount);

// Whether the pools serve requests, decided on first use from KELCORE_SMALLBLOCK.
enum Mode : int { kUndecided, kPools, kUnpooled };
constinit std::atomic<int> gMode{kUndecided};

bool PoolsEnabled() noexcept {
  int mode = gMode.load(std::memory_order_acquire);
  if (mode == kUndecided) [[unlikely]] {
    const char* setting = std::getenv("KELCORE_SMALLBLOCK");
    const int chosen = setting != nullptr && std::strcmp(setting, "0") == 0 ? kUnpooled : kPools;
    // Racing first users agree on whichever choice lands first (they read the same).
    if (gMode.compare_exchange_strong(mode, chosen, std::memory_order_acq_rel)) mode = chosen;
  }
  return mode == kPools;
}

// Blocks that bypass the pools, counted for snapshots.
struct BypassCounters {
  std::atomic<std::uint64_t> largeBlocks{0};
  std::atomic<std::uint64_t> largeBytes{0};
  std::atomic<std::uint64_t> heapBlocks{0};
  std::atomic<std::uint64_t> heapBytes{0};
};
constinit BypassCounters gBypass;

void* AllocateLarge(unsigned int size) {
  void* block = MapPages(size);
  if (block == nullptr) throw std::bad_alloc();
  gBypass.largeBlocks.fetch_add(1, std::memory_order_relaxed);
  gBypass.largeBytes.fetch_add(size, std::memory_order_relaxed);
  return block;
}

void DisposeLarge(void* block, unsigned int size) noexcept {
  UnmapPages(block, size);
  gBypass.largeBlocks.fetch_sub(1, std::memory_order_relaxed);
  gBypass.largeBytes.fetch_sub(size, std::memory_order_relaxed);
}

// With the pools off: the aligned heap below kMaxSmallSize, virtual memory from there on.
void* AllocateUnpooled(unsigned int size) {
  if (size >= kMaxSmallSize) return AllocateLarge(size);
  void* block = AlignedHeapAllocate(size == 0 ? 16 : (size + 15) & ~15u);
  if (block == nullptr) throw std::bad_alloc();
  gBypass.heapBlocks.fetch_add(1, std::memory_order_relaxed);
  gBypass.heapBytes.fetch_add(size, std::memory_order_relaxed);
  return block;
}

void DisposeUnpooled(void* block, unsigned int size) noexcept {
  if (size >= kMaxSmallSize) return DisposeLarge(block, size);
  AlignedHeapFree(block);
  gBypass.heapBlocks.fetch_sub(1, std::memory_order_relaxed);
  gBypass.heapBytes.fetch_sub(size, std::memory_order_relaxed);
}

// The calling thread's cache; null until its first pooled request, and again once the
// thread has begun to exit (tCacheRetired), after which its requests go straight to the
// shared lists.
constinit thread_local ThreadCache* tCache KELCORE_INITIAL_EXEC_TLS = nullptr;
constinit thread_local bool tCacheRetired KELCORE_INITIAL_EXEC_TLS = false;

// Hands the thread's cache back when the thread ends.
struct CacheReaper {
  ~CacheReaper() {
    ThreadCache* cache = tCache;
    tCache = nullptr;
    tCacheRetired = true;
    if (cache != nullptr) DestroyThreadCache(cache);
  }
};
thread_local CacheReaper tReaper;

ThreadCache* AttachCache() noexcept {
  if (tCacheRetired) return nullptr;
  ThreadCache* cache = CreateThreadCache();
  if (cache == nullptr) return nullptr;
  // The first use of the thread_local constructs it and schedules its destructor.
  [[maybe_unused]] CacheReaper& reaper = tReaper;
  tCache = cache;
  return cache;
}

FreeBlock* PopCached(CacheBin& bin) noexcept {
  FreeBlock* block = bin.head;
  bin.head = block->next;
  // The next allocation of this class reads the new head's link.
  __builtin_prefetch(bin.head);
  bin.room.store(bin.room.load(std::memory_order_relaxed) + 1, std::memory_order_relaxed);
  return block;
}

// `room` is the bin's room, read by the caller: at least 1.
void PushCached(CacheBin& bin, std::uint32_t room, void* block) noexcept {
  bin.room.store(room - 1, std::memory_order_relaxed);
  bin.head = ::new (block) FreeBlock{bin.head};
}

[[gnu::noinline]] void* AllocateSlow(unsigned int size) {
  if (!PoolsEnabled()) return AllocateUnpooled(size);
  if (size > kMaxSmallSize) {
    if (size == kLargestClassSize) return TakeBlock(kLargestClass);
    return AllocateLarge(size);
  }
  const std::uint8_t cls = kSizeTable[size];
  ThreadCache* cache = tCache;
  if (cache == nullptr) {
    cache = AttachCache();
    if (cache == nullptr) return TakeBlock(cls);
  }
  // The bin is empty, or the fast path would have served the request.
  RefillBin(*cache, cls);
  return PopCached(cache->bins[cls]);
}

[[gnu::noinline]] void DisposeSlow(void* block, unsigned int size) noexcept {
  if (block == nullptr) return;
  if (!PoolsEnabled()) return DisposeUnpooled(block, size);
  if (size > kMaxSmallSize) {
    if (size == kLargestClassSize) return GiveBlock(kLargestClass, block);
    return DisposeLarge(block, size);
  }
  const std::uint8_t cls = kSizeTable[size];
  ThreadCache* cache = tCache;
  if (cache == nullptr) cache = AttachCache();
  if (cache == nullptr) return GiveBlock(cls, block);
  CacheBin& bin = cache->bins[cls];
  if (bin.room.load(std::memory_order_relaxed) == 0 && !MakeRoom(*cache, cls)) {
    return GiveBlock(cls, block);
  }
  PushCached(bin, bin.room.load(std::memory_order_relaxed), block);
}

}  // namespace
}  // namespace kelcore::utility::smallblock

namespace kelcore::utility::SmallBlockAllocator {

namespace sb = smallblock;

// The fast paths: a cached block of the request's class, with no call and no lock.
void* Allocate(unsigned int size) {
  sb::ThreadCache* cache = sb::tCache;
  if (size <= sb::kMaxSmallSize && cache != nullptr) [[likely]] {
    sb::CacheBin& bin = cache->bins[sb::kSizeTable[size]];
    if (bin.head != nullptr) [[likely]] {
      return sb::PopCached(bin);
    }
  }
  return sb::AllocateSlow(size);
}

void Dispose(void* block, unsigned int size) noexcept {
  sb::ThreadCache* cache = sb::tCache;
  if (size <= sb::kMaxSmallSize && cache != nullptr && block != nullptr) [[likely]] {
    sb::CacheBin& bin = cache->bins[sb::kSizeTable[size]];
    const std::uint32_t room = bin.room.load(std::memory_order_relaxed);
    if (room != 0) [[likely]] {
      sb::PushCached(bin, room, block);
      return;
    }
  }
  sb::DisposeSlow(block, size);
}

unsigned int GetActualAllocationSize(unsigned int size) {
  if (size > sb::kMaxSmallSize || !sb::PoolsEnabled()) return size;
  return sb::kClasses[sb::kSizeTable[size]].blockSize;
}

bool Metrics::GetSnapshot(Snapshot& snapshot) {
  snapshot = Snapshot{};
  snapshot.poolsEnabled = sb::PoolsEnabled();
  snapshot.largeBlocks = sb::gBypass.largeBlocks.load(std::memory_order_relaxed);
  snapshot.largeBytes = sb::gBypass.largeBytes.load(std::memory_order_relaxed);
  snapshot.heapBlocks = sb::gBypass.heapBlocks.load(std::memory_order_relaxed);
  snapshot.heapBytes = sb::gBypass.heapBytes.load(std::memory_order_relaxed);
  if (!snapshot.poolsEnabled) return false;

  std::array<std::uint64_t, sb::kClassCount> cached{};
  snapshot.threadCaches = sb::GatherCachedBlocks(cached);
  for (std::uint8_t cls = 0; cls < sb::kClassCount; ++cls) {
    const sb::PoolFigures pool = sb::ReadPoolFigures(cls);
    ClassFigures& figures = snapshot.classes[cls];
    figures.blockSize = sb::kClasses[cls].blockSize;
    figures.chunks = pool.chunks;
    figures.chunkBytes = pool.chunkBytes;
    figures.blocksCached = cached[cls];
    figures.blocksFree = pool.freeBlocks;
    const std::uint64_t idle = figures.blocksCached + figures.blocksFree;
    figures.blocksInUse = pool.blocks > idle ? pool.blocks - idle : 0;
    figures.bytesInUse = figures.blocksInUse * figures.blockSize;
  }
  snapshot.systemChunks = sb::SystemChunkCount();
  snapshot.systemChunkBytes = snapshot.systemChunks * sb::kSystemChunkSize;
  snapshot.recordBytes = sb::BatchSlabBytes();
  return true;
}

}  // namespace kelcore::utility::SmallBlockAllocator
