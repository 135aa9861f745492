// CompletionPort: the ready queue of a set of worker threads. Any thread posts packets
// (non-null pointers); workers take them in posting order and sleep while there are
// none.
//
// Neither posting nor taking takes a lock: the packets travel through an MPMCQueue,
// and sleeping goes through an EventCount, so a post makes a system call only when a
// worker sleeps and no other post is already waking one. A worker that finds the queue
// empty spins briefly before it sleeps, which keeps a steady stream of posts from
// paying for a wake-up each.
//
// A post happens-before the take that returns its packet.
#pragma once

#include "threads/EventCount.h"
#include "threads/MPMCQueue.h"

#include <atomic>
#include <cstdint>

namespace kelcore::threads::detail {

class CompletionPort {
 public:
  CompletionPort() = default;
  CompletionPort(const CompletionPort&) = delete;
  CompletionPort& operator=(const CompletionPort&) = delete;

  // `packet` must not be null. Throws std::bad_alloc when the queue cannot grow.
  void Post(void* packet);
  // Wakes every sleeping worker (they find no packet unless one was posted).
  void WakeAll() noexcept;

  // Returns the oldest packet, waiting at most `timeoutMicroseconds` (negative: no
  // limit); null when the time ran out.
  void* Take(std::int64_t timeoutMicroseconds);
  // Returns the oldest packet or null, without waiting.
  void* TryTake();

  // Snapshots: whether no packet is queued, and how many workers are spinning or
  // sleeping in Take without having been woken.
  bool Empty() const noexcept { return queue_.Empty(); }
  int IdleWorkers() const noexcept;

 private:
  MPMCQueue<void*> queue_;
  EventCount event_;  // read by every post
  // Written by every worker that spins: kept off the line that posts read.
  [[maybe_unused]] char pad_[64];
  std::atomic<int> spinning_{0};
};

}  // namespace kelcore::threads::detail
