#include "threads/EventCount.h"

#include "threads/WaitWord.h"

#include <chrono>

namespace kelcore::threads::detail {
namespace {

std::int64_t NowMicroseconds() noexcept {
  return std::chrono::duration_cast<std::chrono::microseconds>(
             std::chrono::steady_clock::now().time_since_epoch())
      .count();
}

}  // namespace

EventCount::Key EventCount::PrepareWait() noexcept {
  const Key key = sequence_.load(std::memory_order_acquire);
  state_.fetch_add(kWaiter, std::memory_order_seq_cst);
  return key;
}

bool EventCount::Leave() noexcept {
  std::uint64_t state = state_.load(std::memory_order_relaxed);
  for (;;) {
    std::uint64_t next = state - kWaiter;
    const bool takeSignal = Signals(state) > Waiters(state) - 1;
    if (takeSignal) next -= kSignal;
    if (state_.compare_exchange_weak(state, next, std::memory_order_acq_rel,
                                     std::memory_order_relaxed)) {
      return takeSignal;
    }
  }
}

void EventCount::CancelWait() noexcept {
  Leave();
}

bool EventCount::CommitWait(Key key, std::int64_t timeoutMicroseconds) noexcept {
  const std::int64_t deadline =
      timeoutMicroseconds < 0 ? -1 : NowMicroseconds() + timeoutMicroseconds;
  for (;;) {
    std::uint64_t state = state_.load(std::memory_order_acquire);
    while (Signals(state) > 0) {
      if (state_.compare_exchange_weak(state, state - kWaiter - kSignal, std::memory_order_acq_rel,
                                       std::memory_order_acquire)) {
        return true;
      }
    }
    std::int64_t remaining = -1;
    if (deadline >= 0) {
      remaining = deadline - NowMicroseconds();
      if (remaining <= 0) return Leave();
    }
    WaitOnWord(sequence_, key, remaining);
    // Read the word before looking at the signals again: a signal handed out after
    // this read changes the word, so the next sleep returns at once.
    key = sequence_.load(std::memory_order_acquire);
  }
}

void EventCount::NotifyOne() noexcept {
  std::uint64_t state = state_.load(std::memory_order_seq_cst);
  for (;;) {
    if (Waiters(state) <= Signals(state)) return;
    if (state_.compare_exchange_weak(state, state + kSignal, std::memory_order_seq_cst)) {
      break;
    }
  }
  sequence_.fetch_add(1, std::memory_order_release);
  WakeOneOnWord(sequence_);
}

void EventCount::NotifyAll() noexcept {
  std::uint64_t state = state_.load(std::memory_order_seq_cst);
  for (;;) {
    if (Waiters(state) <= Signals(state)) return;
    const std::uint64_t next = (static_cast<std::uint64_t>(Waiters(state)) << 32) | Waiters(state);
    if (state_.compare_exchange_weak(state, next, std::memory_order_seq_cst)) {
      break;
    }
  }
  sequence_.fetch_add(1, std::memory_order_release);
  WakeAllOnWord(sequence_);
}

int EventCount::UnsignalledWaiters() const noexcept {
  const std::uint64_t state = state_.load(std::memory_order_seq_cst);
  return static_cast<int>(Waiters(state) - Signals(state));
}

}  // namespace kelcore::threads::detail
