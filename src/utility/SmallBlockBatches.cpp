#include "utility/SmallBlockBatches.h"

#include <mutex>
#include <new>

#include "utility/SmallBlockGlobal.h"
#include "utility/SmallBlockSystemMemory.h"

namespace kelcore::utility::smallblock {
namespace {

constexpr std::uint32_t kSlabShift = 12;
constexpr std::uint32_t kRecordsPerSlab = 1u << kSlabShift;  // 64 KiB of records
constexpr std::uint32_t kMaxSlabs = 1u << 14;

struct RecordSlabs {
  std::atomic<Batch*> slabs[kMaxSlabs] = {};
  std::atomic<std::uint32_t> slabCount{0};
  std::mutex growth;  // serializes mapping new slabs
  BatchStack spare;   // records describing no batch
};

constinit Global<RecordSlabs> gRecords;

constexpr std::uint64_t Pack(std::uint32_t indexPlusOne, std::uint32_t tag) {
  return (static_cast<std::uint64_t>(tag) << 32) | indexPlusOne;
}

}  // namespace

Batch& BatchAt(BatchIndex index) noexcept {
  Batch* slab = gRecords->slabs[index >> kSlabShift].load(std::memory_order_acquire);
  return slab[index & (kRecordsPerSlab - 1)];
}

void BatchStack::PushChain(BatchIndex first, BatchIndex last) noexcept {
  Batch& tail = BatchAt(last);
  std::uint64_t top = top_.load(std::memory_order_relaxed);
  std::uint64_t next;
  do {
    tail.link.store(static_cast<std::uint32_t>(top), std::memory_order_relaxed);
    next = Pack(first + 1, static_cast<std::uint32_t>(top >> 32) + 1);
  } while (
      !top_.compare_exchange_weak(top, next, std::memory_order_release, std::memory_order_relaxed));
}

bool BatchStack::Pop(BatchIndex& index) noexcept {
  std::uint64_t top = top_.load(std::memory_order_acquire);
  std::uint64_t next;
  do {
    const auto indexPlusOne = static_cast<std::uint32_t>(top);
    if (indexPlusOne == 0) return false;
    // The record may be popped and pushed elsewhere meanwhile; the tag then makes the
    // exchange fail, and the link read here is discarded.
    const BatchIndex link = BatchAt(indexPlusOne - 1).link.load(std::memory_order_relaxed);
    next = Pack(link, static_cast<std::uint32_t>(top >> 32) + 1);
  } while (
      !top_.compare_exchange_weak(top, next, std::memory_order_acquire, std::memory_order_acquire));
  index = static_cast<std::uint32_t>(top) - 1;
  return true;
}

bool AcquireBatch(BatchIndex& index) noexcept {
  RecordSlabs& records = *gRecords;
  if (records.spare.Pop(index)) return true;
  std::lock_guard lock(records.growth);
  if (records.spare.Pop(index)) return true;
  const std::uint32_t slabNumber = records.slabCount.load(std::memory_order_relaxed);
  if (slabNumber == kMaxSlabs) return false;
  void* memory = MapPages(sizeof(Batch) * kRecordsPerSlab);
  if (memory == nullptr) return false;
  Batch* slab = ::new (memory) Batch[kRecordsPerSlab];
  records.slabs[slabNumber].store(slab, std::memory_order_release);
  records.slabCount.store(slabNumber + 1, std::memory_order_relaxed);
  // Record 0 of the slab goes to the caller, the others onto the spare stack in one go.
  const BatchIndex base = slabNumber << kSlabShift;
  for (std::uint32_t i = 1; i + 1 < kRecordsPerSlab; ++i) {
    slab[i].link.store(base + i + 2, std::memory_order_relaxed);
  }
  records.spare.PushChain(base + 1, base + kRecordsPerSlab - 1);
  index = base;
  return true;
}

void ReleaseBatch(BatchIndex index) noexcept {
  gRecords->spare.Push(index);
}

void ReleaseBatchChain(BatchIndex first, BatchIndex last) noexcept {
  gRecords->spare.PushChain(first, last);
}

std::uint64_t BatchSlabBytes() noexcept {
  return std::uint64_t{gRecords->slabCount.load(std::memory_order_relaxed)} * sizeof(Batch) *
         kRecordsPerSlab;
}

}  // namespace kelcore::utility::smallblock
