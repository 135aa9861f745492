#include "threads/WorkerSet.h"

#include <kelcore/threads/NamedThread.h>

#include "threads/DelayedCallTimer.h"
#include "threads/WaitWord.h"
#include "threads/WorkerExceptionReport.h"

#include <boost/make_shared.hpp>

#include <mutex>
#include <system_error>
#include <thread>

namespace kelcore::threads::detail {
namespace {

// The report site of the pool's workers.
const WorkerReportSite kPoolWorkerSite = {"kelcore::threads::ThreadPool::WorkerMain", __FILE__,
                                          __LINE__, __LINE__};

// A packet that tells one worker to end.
char stopPacket;

}  // namespace

struct WorkerSet::State {
  State(std::string name, Limits workerLimits, DelayedCallTimer* timer)
      : threadName(std::move(name)), limits(workerLimits), growthTimer(timer) {}

  // Has the growth timer check this set soon, unless a check is armed already.
  void ArmGrowthCheck() {
    if (growthTimer == nullptr ||
        static_cast<int>(live.load(std::memory_order_relaxed)) >= limits.maxThreads ||
        growthArmed.exchange(true, std::memory_order_seq_cst)) {
      return;
    }
    try {
      growthTimer->ArmWorkerCheck(limits.growthCheckMicroseconds);
    } catch (...) {  // no timer thread: a later post tries again
      growthArmed.store(false, std::memory_order_release);
    }
  }

  const std::string threadName;
  const Limits limits;
  DelayedCallTimer* const growthTimer;
  CompletionPort port;
  std::atomic<std::uint32_t> live{0};   // workers started and not ended; the word the
                                        // destructor sleeps on
  std::atomic<std::uint64_t> taken{0};  // calls taken (counted only by growing sets)
  std::uint64_t takenAtLastCheck = 0;   // the timer thread's alone
  std::atomic<bool> growthArmed{false};
  std::atomic<bool> stopping{false};
  std::mutex startMutex;  // serialises the start of the base workers
  std::atomic<bool> started{false};
};

WorkerSet::WorkerSet(std::string threadName, Limits limits, DelayedCallTimer* growthTimer)
    : state_(boost::make_shared<State>(std::move(threadName), limits, growthTimer)) {}

WorkerSet::~WorkerSet() {
  state_->stopping.store(true, std::memory_order_seq_cst);
  const std::uint32_t live = state_->live.load(std::memory_order_seq_cst);
  for (std::uint32_t i = 0; i < live; ++i) {
    for (;;) {
      try {
        state_->port.Post(&stopPacket);
        break;
      } catch (const std::bad_alloc&) {
        std::this_thread::yield();
      }
    }
  }
  for (;;) {
    const std::uint32_t left = state_->live.load(std::memory_order_acquire);
    if (left == 0) break;
    WaitOnWord(state_->live, left, -1);
  }
}

int WorkerSet::LiveWorkers() const noexcept {
  return static_cast<int>(state_->live.load(std::memory_order_relaxed));
}

bool WorkerSet::TryStartWorker() {
  State& state = *state_;
  std::uint32_t live = state.live.load(std::memory_order_relaxed);
  do {
    if (state.stopping.load(std::memory_order_relaxed)) return false;
    if (live >= static_cast<std::uint32_t>(state.limits.maxThreads)) return false;
  } while (!state.live.compare_exchange_weak(live, live + 1, std::memory_order_seq_cst,
                                             std::memory_order_relaxed));
  // Either the destructor counts this worker and posts it a stop, or this sees it stopping.
  if (state.stopping.load(std::memory_order_seq_cst)) {
    if (state.live.fetch_sub(1, std::memory_order_acq_rel) == 1) WakeAllOnWord(state.live);
    return false;
  }
  try {
    const boost::shared_ptr<State> shared = state_;
    CreateNamedThread(state.threadName, kThreadPriorityNormal, {}, {}, [shared] {
      WorkerMain(shared);
    }).detach();
  } catch (...) {
    if (state.live.fetch_sub(1, std::memory_order_acq_rel) == 1) WakeAllOnWord(state.live);
    throw;
  }
  return true;
}

void WorkerSet::StartBaseWorkers() {
  State& state = *state_;
  std::lock_guard<std::mutex> lock(state.startMutex);
  if (state.started.load(std::memory_order_acquire)) return;
  for (int i = 0; i < state.limits.baseThreads; ++i) {
    try {
      TryStartWorker();
    } catch (const std::system_error&) {
      // The set works with fewer; with none, the call cannot be accepted.
      if (state.live.load(std::memory_order_acquire) == 0) throw;
      break;
    }
  }
  state.started.store(true, std::memory_order_release);
}

void WorkerSet::Post(PoolFunction* call) {
  State& state = *state_;
  try {
    if (!state.started.load(std::memory_order_acquire)) StartBaseWorkers();
    state.port.Post(call);
  } catch (...) {
    delete call;
    throw;
  }
  // With nobody idle, the call waits behind running ones: let the growth check watch.
  if (state.growthTimer != nullptr && state.port.IdleWorkers() == 0) state.ArmGrowthCheck();
}

bool WorkerSet::CheckGrowth() {
  State& state = *state_;
  const std::uint64_t taken = state.taken.load(std::memory_order_relaxed);
  const bool stalled = taken == state.takenAtLastCheck;
  state.takenAtLastCheck = taken;
  if (state.stopping.load(std::memory_order_relaxed)) return false;
  if (state.port.Empty()) {
    // Disarm, then look again: a post that found the check armed a moment ago did not
    // arm it, so either its call is seen here or it sees the check disarmed.
    state.growthArmed.store(false, std::memory_order_seq_cst);
    return !state.port.Empty() && !state.growthArmed.exchange(true, std::memory_order_seq_cst);
  }
  if (stalled && state.port.IdleWorkers() == 0) {
    try {
      TryStartWorker();
    } catch (const std::system_error&) {  // try again at the next check
    }
  }
  if (static_cast<int>(state.live.load(std::memory_order_relaxed)) < state.limits.maxThreads) {
    return true;
  }
  state.growthArmed.store(false, std::memory_order_seq_cst);
  return false;
}

void WorkerSet::WorkerMain(const boost::shared_ptr<State>& shared) {
  State& state = *shared;
  const bool grows = state.limits.maxThreads > state.limits.baseThreads;
  for (;;) {
    const bool aboveBase =
        static_cast<int>(state.live.load(std::memory_order_relaxed)) > state.limits.baseThreads;
    void* packet = state.port.Take(aboveBase ? state.limits.idleMicroseconds : -1);
    if (packet == nullptr) {  // idle for the idle time: end if still above the base
      std::uint32_t live = state.live.load(std::memory_order_relaxed);
      bool retired = false;
      while (static_cast<int>(live) > state.limits.baseThreads && !retired) {
        retired = state.live.compare_exchange_weak(live, live - 1, std::memory_order_acq_rel,
                                                   std::memory_order_relaxed);
      }
      if (retired) return;
      continue;
    }
    if (packet == &stopPacket) break;
    if (grows) {
      state.taken.fetch_add(1, std::memory_order_relaxed);
      // A call this worker may be stuck in has others waiting behind it.
      if (!state.port.Empty() && state.port.IdleWorkers() == 0) state.ArmGrowthCheck();
    }
    auto* call = static_cast<PoolFunction*>(packet);
    if (!call->Cancelled()) RunReportingExceptions(call->fn, kPoolWorkerSite);
    delete call;
  }
  if (state.live.fetch_sub(1, std::memory_order_acq_rel) == 1) WakeAllOnWord(state.live);
}

}  // namespace kelcore::threads::detail
