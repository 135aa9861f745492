// The shared side of the small-block allocator: for every size class a lock-free stack
// of free batches (any thread may push or pop), and the chunks the class has carved
// into blocks. Chunks are kept for the life of the process; a disposed block goes back
// to the shared list of the class its size names, whichever chunk it came from.
//
// A class grows when its shared list is empty: under the class's own mutex it obtains
// its next chunk (sized by NextChunkSize from the running total of its chunk bytes),
// fills the chunk header and links every block of the chunk into batches. Chunks of
// 4128 and 66080 bytes are blocks of those classes, so growth locks classes in
// ascending order of block size and cannot deadlock; 925152-byte chunks are mapped
// from the operating system.
#pragma once

#include <cstdint>

#include "utility/SmallBlockBatches.h"

namespace kelcore::utility::smallblock {

// A batch of free blocks of class `cls`, now owned by the caller (record included).
// Throws std::bad_alloc when the class must grow and no memory is left.
BatchIndex TakeBatch(std::uint8_t cls);
// Hands a batch of at least one block back to the class's shared list.
void GiveBatch(std::uint8_t cls, BatchIndex index) noexcept;

// Single blocks, for threads without a cache and for chunks of the smaller classes.
// TakeBlock throws std::bad_alloc. GiveBlock needs a batch record; if none can be
// mapped (memory exhausted) the block stays out of circulation.
void* TakeBlock(std::uint8_t cls);
void GiveBlock(std::uint8_t cls, void* block) noexcept;

struct PoolFigures {
  std::uint64_t chunks;      // chunks obtained
  std::uint64_t chunkBytes;  // their total size
  std::uint64_t blocks;      // blocks carved from them
  std::uint64_t freeBlocks;  // blocks in the shared list
};
PoolFigures ReadPoolFigures(std::uint8_t cls) noexcept;

// Chunks of kSystemChunkSize bytes mapped from the operating system.
std::uint64_t SystemChunkCount() noexcept;

}  // namespace kelcore::utility::smallblock
