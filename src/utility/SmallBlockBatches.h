// Free blocks travel between threads in batches: a null-terminated chain of free blocks
// of one class, linked through their first word, described by a batch record.
//
// Records live in slabs of their own that are never given back or reused for anything
// else, so a lock-free stack of records may read the link of a record that another
// thread has just popped without ever touching memory handed to a caller. Records are
// named by 32-bit indices, which lets a stack head hold an index and a 32-bit tag that
// changes on every modification in one 64-bit word: ABA safety with a single-word
// compare-and-swap on every platform.
#pragma once

#include <atomic>
#include <cstdint>

namespace kelcore::utility::smallblock {

// What a free block holds: the link to the next free block of its chain.
struct FreeBlock {
  FreeBlock* next;
};

using BatchIndex = std::uint32_t;

struct Batch {
  std::atomic<BatchIndex> link{0};  // used only by BatchStack: index + 1 below, 0 at the end
  std::uint32_t count = 0;          // blocks in the chain
  FreeBlock* head = nullptr;
};

// Records are addressed by index; only indices obtained from AcquireBatch are valid.
Batch& BatchAt(BatchIndex index) noexcept;

// An ABA-safe lock-free stack of batch records. Push publishes the record (and the chain
// it describes) with release ordering; Pop acquires it. Either may run concurrently on
// any number of threads.
class BatchStack {
 public:
  constexpr BatchStack() = default;

  void Push(BatchIndex index) noexcept { PushChain(index, index); }
  // Pushes records already linked first -> ... -> last through Batch::link.
  void PushChain(BatchIndex first, BatchIndex last) noexcept;
  bool Pop(BatchIndex& index) noexcept;

 private:
  // Low word: index + 1 of the top record (0 when empty); high word: modification tag.
  std::atomic<std::uint64_t> top_{0};
};

// A record for a new batch; false when no memory is left for a new slab of records.
bool AcquireBatch(BatchIndex& index) noexcept;
// Gives a record back once its batch has been taken apart.
void ReleaseBatch(BatchIndex index) noexcept;
// Gives back records linked first -> ... -> last through Batch::link (index + 1).
void ReleaseBatchChain(BatchIndex first, BatchIndex last) noexcept;

// Bytes of record slabs mapped so far.
std::uint64_t BatchSlabBytes() noexcept;

}  // namespace kelcore::utility::smallblock
