// kelcore's sized small-block allocator.
//
// Callers give the size both when allocating and when disposing, so blocks carry no
// header. Requests of up to 8192 bytes come from 72 size classes (8, 16, 24, 32-256 by
// 16, 288-512 by 32, 640, 768, 896, 1024, 1152-4096 by 128, 4128, 4352-8192 by 256, and
// 66080); a request gets a block of the smallest class that holds it. Requests of 0 to
// 8 bytes share the 8-byte class, since a free block must hold a pointer. Requests of
// exactly 66080 bytes have their own class; every other request above 8192 bytes is
// mapped from the operating system's virtual memory on each call and unmapped on
// disposal.
//
// Pools. A class takes memory in chunks (a 32-byte header, then blocks back to back)
// whose size grows with the chunk bytes the class already holds: the smaller classes
// start with 4128-byte chunks, the larger ones with 66080-byte chunks, and busy classes
// move on to 925152-byte chunks mapped from the operating system. The 4128- and
// 66080-byte chunks are blocks of those two classes. Chunks are never given back while
// the process runs: a disposed block is reused for its class only.
//
// Threads. Every function here may be called from any thread at any time, including
// from static constructors and destructors and from thread-exit code. Each thread keeps
// a small cache of free blocks per class; it exchanges batches of blocks with the
// class's shared free list, an ABA-safe lock-free stack, and hands everything back when
// it ends. A block may be disposed on any thread, not only the one that allocated it;
// the caller must make the disposal happen after its last use of the block (as for any
// allocator). Allocate and Dispose take no lock except when a class grows by a chunk
// and when a thread sets up or hands back its cache.
//
// Alignment. Every block is aligned to 16 bytes, except blocks of the 8- and 24-byte
// classes (requests of 0-8 and 17-24 bytes), which are aligned to 8 bytes; blocks above
// 8192 bytes are page aligned. A request for n * sizeof(T) bytes is therefore aligned
// for T whenever alignof(T) <= 16 (kBlockAlignment).
//
// Switching the pools off. If the environment variable KELCORE_SMALLBLOCK is "0" when
// the allocator is first used, the pools stay off for the life of the process:
// requests below 8192 bytes go to the C runtime's 16-byte aligned heap, larger ones to
// virtual memory, and GetActualAllocationSize returns its argument. The variable is
// read once; later changes have no effect.
#pragma once

#include <kelcore/Export.h>

#include <cstddef>
#include <cstdint>
#include <functional>
#include <limits>
#include <map>
#include <new>
#include <utility>
#include <vector>

namespace kelcore::utility::SmallBlockAllocator {

// Alignment every block of a request of n * sizeof(T) bytes has when alignof(T) <= 16.
inline constexpr std::size_t kBlockAlignment = 16;

// Returns a block of at least `size` bytes (GetActualAllocationSize(size) usable bytes),
// never null; a request of 0 bytes returns a distinct block too. The contents are
// unspecified. Throws std::bad_alloc when no memory is left.
KELCORE_API void* Allocate(unsigned int size);

// Returns a block to its pool. `size` must be the size given to Allocate for this block
// (the size names the block's class; a wrong size corrupts the pools, as freeing a block
// twice does). A null block is ignored. Never throws.
KELCORE_API void Dispose(void* block, unsigned int size) noexcept;

// The number of usable bytes a request of `size` bytes really receives: the block size
// of its class while the pools are on and size <= 8192; otherwise `size` itself.
KELCORE_API unsigned int GetActualAllocationSize(unsigned int size);

namespace Metrics {

inline constexpr std::size_t kClassCount = 72;

struct ClassFigures {
  unsigned int blockSize = 0;
  std::uint64_t chunks = 0;        // chunks the class has obtained (none is given back)
  std::uint64_t chunkBytes = 0;    // their total size, which decides the next chunk's size
  std::uint64_t blocksInUse = 0;   // handed to callers and not yet disposed
  std::uint64_t bytesInUse = 0;    // blocksInUse * blockSize
  std::uint64_t blocksCached = 0;  // free, held in per-thread caches
  std::uint64_t blocksFree = 0;    // free, in the class's shared list
};

struct Snapshot {
  bool poolsEnabled = false;
  // Ascending by block size. The blocks of the 4128 and 66080 classes that serve as
  // chunks of smaller classes count as in use, and so do the per-thread caches, which
  // are pool blocks themselves (about 1.2 KB each). All zero while the pools are off.
  ClassFigures classes[kClassCount];
  std::uint64_t systemChunks = 0;      // 925152-byte chunks mapped for the pools
  std::uint64_t systemChunkBytes = 0;  // systemChunks * 925152
  std::uint64_t recordBytes = 0;       // bookkeeping memory for the shared free lists
  std::uint64_t threadCaches = 0;      // threads holding a cache now
  std::uint64_t largeBlocks = 0;       // live blocks mapped straight from virtual memory
  std::uint64_t largeBytes = 0;        // their requested sizes
  std::uint64_t heapBlocks = 0;        // live blocks from the aligned heap (pools off)
  std::uint64_t heapBytes = 0;         // their requested sizes
};

// Fills `snapshot` and returns whether the pools are on. The figures are read without
// stopping other threads: each counter is exact, but while other threads allocate the
// counters may be from slightly different moments (the in-use counts may then be off by
// the blocks in flight). With no other thread allocating, every figure is exact.
KELCORE_API bool GetSnapshot(Snapshot& snapshot);

}  // namespace Metrics

// Converts a C++ allocation size to the allocator's; throws std::bad_alloc above
// 4 GiB - 1.
inline unsigned int ToRequestSize(std::size_t size) {
  if (size > std::numeric_limits<unsigned int>::max()) throw std::bad_alloc();
  return static_cast<unsigned int>(size);
}

// Base class giving T, and the classes derived from it, class-level operator new and
// delete over Allocate and Dispose:
//   class Node : public SmallBlockAllocator::Allocated<Node> { ... };
// Delete passes the size of the object's dynamic type, so deleting a derived object
// through a base pointer needs a virtual destructor (as it always does). The nothrow
// form returns null on failure; if the constructor then throws, the block is disposed
// as sizeof(T) bytes, so only T itself (not a class derived from it) may be created with
// new (std::nothrow). Arrays use the global operator new[].
template <class T>
class Allocated {
 public:
  static void* operator new(std::size_t size) { return Allocate(ToRequestSize(size)); }
  static void* operator new(std::size_t, void* place) noexcept { return place; }
  static void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    if (size > std::numeric_limits<unsigned int>::max()) return nullptr;
    try {
      return Allocate(static_cast<unsigned int>(size));
    } catch (const std::bad_alloc&) {
      return nullptr;
    }
  }

  static void operator delete(void* block, std::size_t size) noexcept {
    Dispose(block, static_cast<unsigned int>(size));
  }
  // Called only when a constructor throws after the placement or nothrow forms above.
  static void operator delete(void*, void*) noexcept {}
  static void operator delete(void* block, const std::nothrow_t&) noexcept {
    Dispose(block, static_cast<unsigned int>(sizeof(T)));
  }
};

// Standard allocator over Allocate and Dispose. Types aligned beyond kBlockAlignment go
// to the global aligned operator new instead. All instances are interchangeable.
template <class T>
class STLAllocator {
 public:
  using value_type = T;

  STLAllocator() noexcept = default;
  template <class U>
  STLAllocator(const STLAllocator<U>&) noexcept {}

  T* allocate(std::size_t n) {
    if (n > std::numeric_limits<unsigned int>::max() / sizeof(T)) throw std::bad_array_new_length();
    const auto bytes = static_cast<unsigned int>(n * sizeof(T));
    if constexpr (alignof(T) > kBlockAlignment) {
      return static_cast<T*>(::operator new (bytes, std::align_val_t{alignof(T)}));
    } else {
      return static_cast<T*>(Allocate(bytes));
    }
  }
  void deallocate(T* p, std::size_t n) noexcept {
    if constexpr (alignof(T) > kBlockAlignment) {
      ::operator delete (p, std::align_val_t{alignof(T)});
    } else {
      Dispose(p, static_cast<unsigned int>(n * sizeof(T)));
    }
  }

  template <class U>
  bool operator==(const STLAllocator<U>&) const noexcept {
    return true;
  }
};

template <class T>
using vector = std::vector<T, STLAllocator<T>>;

template <class Key, class Value, class Compare = std::less<Key>>
using map = std::map<Key, Value, Compare, STLAllocator<std::pair<const Key, Value>>>;

}  // namespace kelcore::utility::SmallBlockAllocator
