#include "threads/CompletionPort.h"

#include "threads/CpuRelax.h"

#include <chrono>
#include <thread>

namespace kelcore::threads::detail {
namespace {

// How long a worker polls an empty queue before it sleeps: rounds of a processor pause
// followed by a look at the queue, then a few yields of the processor.
constexpr int kSpinRounds = 256;
constexpr int kYieldRounds = 4;

std::int64_t NowMicroseconds() noexcept {
  return std::chrono::duration_cast<std::chrono::microseconds>(
             std::chrono::steady_clock::now().time_since_epoch())
      .count();
}

}  // namespace

void CompletionPort::Post(void* packet) {
  queue_.Push(packet);  // a sequentially consistent claim of the tail
  event_.NotifyOne();
}

void CompletionPort::WakeAll() noexcept {
  event_.NotifyAll();
}

void* CompletionPort::TryTake() {
  void* packet = nullptr;
  return queue_.TryPop(packet) ? packet : nullptr;
}

void* CompletionPort::Take(std::int64_t timeoutMicroseconds) {
  if (void* packet = TryTake()) return packet;
  if (timeoutMicroseconds == 0) return nullptr;

  spinning_.fetch_add(1, std::memory_order_seq_cst);
  for (int round = 0; round < kSpinRounds + kYieldRounds; ++round) {
    if (round < kSpinRounds) {
      CpuRelax();
    } else {
      std::this_thread::yield();
    }
    if (void* packet = TryTake()) {
      spinning_.fetch_sub(1, std::memory_order_seq_cst);
      return packet;
    }
  }
  spinning_.fetch_sub(1, std::memory_order_seq_cst);

  const std::int64_t deadline =
      timeoutMicroseconds < 0 ? -1 : NowMicroseconds() + timeoutMicroseconds;
  for (;;) {
    const EventCount::Key key = event_.PrepareWait();
    if (void* packet = TryTake()) {
      event_.CancelWait();
      return packet;
    }
    std::int64_t remaining = -1;
    if (deadline >= 0) {
      remaining = deadline - NowMicroseconds();
      if (remaining < 0) remaining = 0;
    }
    const bool signalled = event_.CommitWait(key, remaining);
    if (void* packet = TryTake()) return packet;
    if (!signalled && deadline >= 0) return nullptr;
    if (deadline >= 0 && NowMicroseconds() >= deadline) return nullptr;
  }
}

int CompletionPort::IdleWorkers() const noexcept {
  return spinning_.load(std::memory_order_seq_cst) + event_.UnsignalledWaiters();
}

}  // namespace kelcore::threads::detail
