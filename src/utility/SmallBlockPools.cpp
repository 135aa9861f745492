#include "utility/SmallBlockPools.h"

#include <mutex>
#include <new>

#include "utility/SmallBlockGlobal.h"
#include "utility/SmallBlockSizeClasses.h"
#include "utility/SmallBlockSystemMemory.h"

namespace kelcore::utility::smallblock {
namespace {

// The first bytes of every chunk; the blocks start kChunkHeaderSize bytes in.
struct ChunkHeader {
  ChunkHeader* self;
  std::uint32_t chunkSize;
  std::uint32_t blockSize;
  std::uint32_t blockCount;  // (chunkSize - kChunkHeaderSize) / blockSize
  std::uint32_t classIndex;
  ChunkHeader* previous;  // the chunk the class obtained before this one
};
static_assert(sizeof(ChunkHeader) <= kChunkHeaderSize);

struct alignas(64) ClassPool {
  BatchStack free;
  std::atomic<std::uint64_t> freeBlocks{0};
  std::atomic<std::uint64_t> chunks{0};
  std::atomic<std::uint64_t> chunkBytes{0};  // the running total that sizes the next chunk
  std::atomic<std::uint64_t> blocks{0};
  std::mutex growth;
  ChunkHeader* lastChunk = nullptr;  // guarded by `growth`
};

struct Pools {
  ClassPool classes[kClassCount];
  std::atomic<std::uint64_t> systemChunks{0};
};

constinit Global<Pools> gPools;

bool PopFree(ClassPool& pool, BatchIndex& index) noexcept {
  if (!pool.free.Pop(index)) return false;
  pool.freeBlocks.fetch_sub(BatchAt(index).count, std::memory_order_relaxed);
  return true;
}

void* ObtainChunk(unsigned int chunkSize) {
  if (chunkSize == kSystemChunkSize) {
    void* memory = MapPages(chunkSize);
    if (memory == nullptr) throw std::bad_alloc();
    gPools->systemChunks.fetch_add(1, std::memory_order_relaxed);
    return memory;
  }
  return TakeBlock(chunkSize == kLargestClassSize ? kLargestClass : kChunkSupplierClass);
}

// `count` records linked first -> ... -> last through Batch::link; all or nothing.
bool AcquireBatchChain(std::uint32_t count, BatchIndex& first, BatchIndex& last) noexcept {
  if (!AcquireBatch(first)) return false;
  last = first;
  for (std::uint32_t n = 1; n < count; ++n) {
    BatchIndex index;
    if (!AcquireBatch(index)) {
      ReleaseBatchChain(first, last);
      return false;
    }
    BatchAt(last).link.store(index + 1, std::memory_order_relaxed);
    last = index;
  }
  return true;
}

// Obtains the class's next chunk and links its blocks into batches; the first batch goes
// to the caller, the others onto the shared list.
BatchIndex Grow(std::uint8_t cls) {
  ClassPool& pool = gPools->classes[cls];
  const SizeClass& sizeClass = kClasses[cls];
  std::lock_guard lock(pool.growth);
  BatchIndex first;
  if (PopFree(pool, first)) return first;  // another thread grew the class meanwhile

  const unsigned int chunkSize =
      NextChunkSize(sizeClass, pool.chunkBytes.load(std::memory_order_relaxed));
  const std::uint32_t blockCount = BlocksPerChunk(sizeClass, chunkSize);
  const std::uint32_t perBatch = BatchSize(sizeClass);
  // Records first: once the chunk is in hand nothing may fail.
  BatchIndex last;
  if (!AcquireBatchChain((blockCount + perBatch - 1) / perBatch, first, last)) {
    throw std::bad_alloc();
  }
  void* memory;
  try {
    memory = ObtainChunk(chunkSize);
  } catch (...) {
    ReleaseBatchChain(first, last);
    throw;
  }

  auto* chunk = ::new (memory)
      ChunkHeader{nullptr, chunkSize, sizeClass.blockSize, blockCount, cls, pool.lastChunk};
  chunk->self = chunk;
  pool.lastChunk = chunk;

  unsigned char* cursor = static_cast<unsigned char*>(memory) + kChunkHeaderSize;
  std::uint32_t remaining = blockCount;
  for (BatchIndex index = first;; index = BatchAt(index).link.load(std::memory_order_relaxed) - 1) {
    const std::uint32_t count = remaining < perBatch ? remaining : perBatch;
    FreeBlock* next = nullptr;
    for (std::uint32_t n = count; n-- > 0;) {
      next = ::new (cursor + std::size_t{n} * sizeClass.blockSize) FreeBlock{next};
    }
    Batch& batch = BatchAt(index);
    batch.head = next;
    batch.count = count;
    cursor += std::size_t{count} * sizeClass.blockSize;
    remaining -= count;
    if (index == last) break;
  }

  pool.chunks.fetch_add(1, std::memory_order_relaxed);
  pool.chunkBytes.fetch_add(chunkSize, std::memory_order_relaxed);
  pool.blocks.fetch_add(blockCount, std::memory_order_relaxed);
  if (first != last) {
    const BatchIndex second = BatchAt(first).link.load(std::memory_order_relaxed) - 1;
    pool.freeBlocks.fetch_add(blockCount - BatchAt(first).count, std::memory_order_relaxed);
    pool.free.PushChain(second, last);
  }
  return first;
}

}  // namespace

BatchIndex TakeBatch(std::uint8_t cls) {
  BatchIndex index;
  if (PopFree(gPools->classes[cls], index)) return index;
  return Grow(cls);
}

void GiveBatch(std::uint8_t cls, BatchIndex index) noexcept {
  ClassPool& pool = gPools->classes[cls];
  pool.freeBlocks.fetch_add(BatchAt(index).count, std::memory_order_relaxed);
  pool.free.Push(index);
}

void* TakeBlock(std::uint8_t cls) {
  const BatchIndex index = TakeBatch(cls);
  Batch& batch = BatchAt(index);
  FreeBlock* block = batch.head;
  if (batch.count > 1) {
    batch.head = block->next;
    --batch.count;
    GiveBatch(cls, index);
  } else {
    ReleaseBatch(index);
  }
  return block;
}

void GiveBlock(std::uint8_t cls, void* block) noexcept {
  BatchIndex index;
  if (!AcquireBatch(index)) return;
  Batch& batch = BatchAt(index);
  batch.head = ::new (block) FreeBlock{nullptr};
  batch.count = 1;
  GiveBatch(cls, index);
}

PoolFigures ReadPoolFigures(std::uint8_t cls) noexcept {
  const ClassPool& pool = gPools->classes[cls];
  return PoolFigures{
      pool.chunks.load(std::memory_order_relaxed), pool.chunkBytes.load(std::memory_order_relaxed),
      pool.blocks.load(std::memory_order_relaxed), pool.freeBlocks.load(std::memory_order_relaxed)};
}

std::uint64_t SystemChunkCount() noexcept {
  return gPools->systemChunks.load(std::memory_order_relaxed);
}

}  // namespace kelcore::utility::smallblock
