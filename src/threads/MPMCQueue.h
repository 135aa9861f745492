// MPMCQueue: an unbounded first-in first-out queue that any number of threads may push
// to and pop from at the same time, without locks.
//
// The queue is a chain of blocks of 31 slots. Head and tail are indices that move
// forward by compare-and-swap; the thread that claims the last slot of a block installs
// the next block, and a block is freed by whichever reader finishes with it last (each
// slot records whether it was read, and a reader that finds a slot still being read
// leaves the freeing to that reader). Blocks come from the small-block allocator.
//
// Progress: no thread ever holds a lock. A pusher or popper that claimed a slot and was
// preempted before finishing can make others spin briefly on that slot (or on the next
// block's installation), never block on the operating system.
//
// Ordering: pops return values in the order their pushes claimed the tail. A push
// happens-before the pop that returns its value. The successful claim of a push and
// the read of the tail by which TryPop finds the queue empty are sequentially
// consistent operations, so an EventCount can be used to sleep on the queue.
//
// T must be trivially copyable (the executors store pointers). The destructor frees
// the blocks only: values still in the queue are not destroyed, so the owner drains it
// first.
#pragma once

#include <kelcore/utility/SmallBlockAllocator.h>

#include "threads/CpuRelax.h"

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <thread>
#include <type_traits>

namespace kelcore::threads::detail {

template <class T>
class MPMCQueue {
  static_assert(std::is_trivially_copyable_v<T>, "MPMCQueue stores trivially copyable values");

 public:
  MPMCQueue() = default;
  MPMCQueue(const MPMCQueue&) = delete;
  MPMCQueue& operator=(const MPMCQueue&) = delete;
  ~MPMCQueue();

  void Push(T value);
  bool TryPop(T& value);
  // A snapshot; only exact while no other thread pushes or pops.
  bool Empty() const noexcept;

 private:
  static constexpr std::size_t kWrite = 1;    // slot: value written
  static constexpr std::size_t kRead = 2;     // slot: value read
  static constexpr std::size_t kDestroy = 4;  // slot: freeing of the block left to its reader
  // Indices advance by 2: the lowest bit of the head says that the head's block is
  // known to have a successor, which lets pops skip reading the tail.
  static constexpr std::size_t kShift = 1;
  static constexpr std::size_t kHasNext = 1;
  static constexpr std::size_t kLap = 32;  // index values per block; the last one is a gap
  static constexpr std::size_t kBlockCapacity = kLap - 1;

  struct Slot {
    T value;
    std::atomic<std::size_t> state{0};
  };

  struct Block : utility::SmallBlockAllocator::Allocated<Block> {
    std::atomic<Block*> next{nullptr};
    Slot slots[kBlockCapacity];

    Block* WaitNext() const noexcept {
      for (unsigned spins = 0;; ++spins) {
        if (Block* successor = next.load(std::memory_order_acquire)) return successor;
        Backoff(spins);
      }
    }
  };

  struct Position {
    std::atomic<std::size_t> index{0};
    std::atomic<Block*> block{nullptr};
  };
  // Keeps the head, the tail and the owner's neighbouring fields on different cache
  // lines without asking for an over-aligned object.
  static constexpr std::size_t kCacheLine = 64;

  static void Backoff(unsigned spins) noexcept {
    if (spins < 64) {
      CpuRelax();
    } else {
      std::this_thread::yield();
    }
  }

  static void WaitWritten(const Slot& slot) noexcept {
    for (unsigned spins = 0; (slot.state.load(std::memory_order_acquire) & kWrite) == 0; ++spins) {
      Backoff(spins);
    }
  }

  // Frees `block` unless a reader of one of the slots from `start` on is still busy,
  // in which case that reader frees it when it is done.
  static void DestroyBlock(Block* block, std::size_t start) noexcept {
    for (std::size_t i = start; i + 1 < kBlockCapacity; ++i) {
      Slot& slot = block->slots[i];
      if ((slot.state.load(std::memory_order_acquire) & kRead) == 0 &&
          (slot.state.fetch_or(kDestroy, std::memory_order_acq_rel) & kRead) == 0) {
        return;
      }
    }
    delete block;
  }

  [[maybe_unused]] char leadingPad_[kCacheLine];
  Position head_;
  [[maybe_unused]] char middlePad_[kCacheLine - sizeof(Position)];
  Position tail_;
  [[maybe_unused]] char trailingPad_[kCacheLine - sizeof(Position)];
};

template <class T>
MPMCQueue<T>::~MPMCQueue() {
  std::size_t head = head_.index.load(std::memory_order_relaxed) & ~kHasNext;
  const std::size_t tail = tail_.index.load(std::memory_order_relaxed) & ~kHasNext;
  Block* block = head_.block.load(std::memory_order_relaxed);
  while (head != tail) {
    if ((head >> kShift) % kLap == kBlockCapacity) {
      Block* successor = block->next.load(std::memory_order_relaxed);
      delete block;
      block = successor;
    }
    head += std::size_t{1} << kShift;
  }
  delete block;
}

template <class T>
void MPMCQueue<T>::Push(T value) {
  std::size_t tail = tail_.index.load(std::memory_order_acquire);
  Block* block = tail_.block.load(std::memory_order_acquire);
  Block* spare = nullptr;  // allocated ahead by the pusher that will install it
  for (unsigned spins = 0;; ++spins) {
    const std::size_t offset = (tail >> kShift) % kLap;
    if (offset == kBlockCapacity) {  // another pusher is installing the next block
      Backoff(spins);
      tail = tail_.index.load(std::memory_order_acquire);
      block = tail_.block.load(std::memory_order_acquire);
      continue;
    }
    if (offset + 1 == kBlockCapacity && spare == nullptr) spare = new Block;
    if (block == nullptr) {  // the very first push installs the first block
      Block* first = new Block;
      Block* expected = nullptr;
      if (tail_.block.compare_exchange_strong(expected, first, std::memory_order_release,
                                              std::memory_order_relaxed)) {
        head_.block.store(first, std::memory_order_release);
        block = first;
      } else {
        delete first;
        tail = tail_.index.load(std::memory_order_acquire);
        block = tail_.block.load(std::memory_order_acquire);
        continue;
      }
    }
    const std::size_t newTail = tail + (std::size_t{1} << kShift);
    if (tail_.index.compare_exchange_weak(tail, newTail, std::memory_order_seq_cst,
                                          std::memory_order_acquire)) {
      if (offset + 1 == kBlockCapacity) {  // claimed the last slot: install the next block
        tail_.block.store(spare, std::memory_order_release);
        tail_.index.store(newTail + (std::size_t{1} << kShift), std::memory_order_release);
        block->next.store(spare, std::memory_order_release);
        spare = nullptr;
      }
      Slot& slot = block->slots[offset];
      slot.value = value;
      slot.state.fetch_or(kWrite, std::memory_order_release);
      delete spare;
      return;
    }
    block = tail_.block.load(std::memory_order_acquire);
    CpuRelax();
  }
}

template <class T>
bool MPMCQueue<T>::TryPop(T& value) {
  std::size_t head = head_.index.load(std::memory_order_acquire);
  Block* block = head_.block.load(std::memory_order_acquire);
  for (unsigned spins = 0;; ++spins) {
    const std::size_t offset = (head >> kShift) % kLap;
    if (offset == kBlockCapacity) {  // another popper is moving to the next block
      Backoff(spins);
      head = head_.index.load(std::memory_order_acquire);
      block = head_.block.load(std::memory_order_acquire);
      continue;
    }
    std::size_t newHead = head + (std::size_t{1} << kShift);
    if ((newHead & kHasNext) == 0) {
      const std::size_t tail = tail_.index.load(std::memory_order_seq_cst);
      if ((head >> kShift) == (tail >> kShift)) return false;
      if ((head >> kShift) / kLap != (tail >> kShift) / kLap) newHead |= kHasNext;
    }
    if (block == nullptr) {  // the first push is installing the first block
      Backoff(spins);
      head = head_.index.load(std::memory_order_acquire);
      block = head_.block.load(std::memory_order_acquire);
      continue;
    }
    if (head_.index.compare_exchange_weak(head, newHead, std::memory_order_seq_cst,
                                          std::memory_order_acquire)) {
      if (offset + 1 == kBlockCapacity) {  // took the last slot: move the head on
        Block* successor = block->WaitNext();
        std::size_t nextIndex = (newHead & ~kHasNext) + (std::size_t{1} << kShift);
        if (successor->next.load(std::memory_order_relaxed) != nullptr) nextIndex |= kHasNext;
        head_.block.store(successor, std::memory_order_release);
        head_.index.store(nextIndex, std::memory_order_release);
      }
      Slot& slot = block->slots[offset];
      WaitWritten(slot);
      value = slot.value;
      if (offset + 1 == kBlockCapacity) {
        DestroyBlock(block, 0);
      } else if ((slot.state.fetch_or(kRead, std::memory_order_acq_rel) & kDestroy) != 0) {
        DestroyBlock(block, offset + 1);
      }
      return true;
    }
    block = head_.block.load(std::memory_order_acquire);
    CpuRelax();
  }
}

template <class T>
bool MPMCQueue<T>::Empty() const noexcept {
  const std::size_t head = head_.index.load(std::memory_order_seq_cst);
  const std::size_t tail = tail_.index.load(std::memory_order_seq_cst);
  return (head >> kShift) == (tail >> kShift);
}

}  // namespace kelcore::threads::detail
