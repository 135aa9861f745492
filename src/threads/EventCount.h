// EventCount: lets consumers of a lock-free queue sleep when it is empty without a lock
// on the queue, and lets producers skip the system call when nobody sleeps.
//
// Consumer:                                  Producer:
//   key = PrepareWait();                       publish the work (a seq_cst operation or
//   if (work available) { CancelWait(); ... }    a seq_cst fence after it);
//   else CommitWait(key, timeout);             NotifyOne();
//
// PrepareWait registers the consumer with a sequentially consistent operation, so
// either the consumer's re-check sees the work or the producer's notify sees the
// registration. A notify hands out a signal only while registered consumers outnumber
// the signals already handed out, so a burst of posts to a queue whose one sleeper is
// already being woken makes one system call, not one per post. A consumer that takes a
// signal must look for work again before sleeping again: a signal stands for work that
// some consumer has to pick up.
#pragma once

#include <atomic>
#include <cstdint>

namespace kelcore::threads::detail {

class EventCount {
 public:
  using Key = std::uint32_t;

  Key PrepareWait() noexcept;
  // Leaves the registration after finding work. Takes a pending signal with it when
  // signals would otherwise outnumber the consumers left.
  void CancelWait() noexcept;
  // Sleeps until signalled or until the time (microseconds, negative: no limit) runs
  // out. Returns true when it took a signal; false on time-out with no signal taken.
  bool CommitWait(Key key, std::int64_t timeoutMicroseconds) noexcept;

  // Call after publishing work, behind a seq_cst operation or fence.
  void NotifyOne() noexcept;
  void NotifyAll() noexcept;

  // Consumers registered and not yet signalled (a snapshot).
  int UnsignalledWaiters() const noexcept;

 private:
  // Low half: registered consumers. High half: signals handed out and not yet taken.
  static constexpr std::uint64_t kWaiter = 1;
  static constexpr std::uint64_t kSignal = std::uint64_t{1} << 32;
  static std::uint32_t Waiters(std::uint64_t state) noexcept {
    return static_cast<std::uint32_t>(state);
  }
  static std::uint32_t Signals(std::uint64_t state) noexcept {
    return static_cast<std::uint32_t>(state >> 32);
  }
  // Removes one consumer and, if needed, one signal; returns whether a signal went.
  bool Leave() noexcept;

  std::atomic<std::uint64_t> state_{0};
  std::atomic<std::uint32_t> sequence_{0};  // the word sleepers wait on
};

}  // namespace kelcore::threads::detail
