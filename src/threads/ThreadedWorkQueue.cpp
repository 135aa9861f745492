#include "threads/ThreadedWorkQueue.h"

#include <kelcore/debug/Assert.h>
#include <kelcore/threads/Gate.h>
#include <kelcore/threads/SyncPoint.h>
#include <kelcore/utility/SmallBlockAllocator.h>

#include "threads/CompletionPort.h"
#include "threads/FunctionItems.h"
#include "threads/WorkerExceptionReport.h"

#include <boost/make_shared.hpp>

#include <algorithm>
#include <atomic>
#include <memory>
#include <mutex>
#include <new>
#include <thread>
#include <vector>

namespace kelcore::threads::detail {
namespace {

// Packets other than functions: a wake-up makes a worker look at the delayed heap
// again; a stop ends one worker.
char wakeUpPacket;
char stopPacket;

// Packets that must arrive (stop requests) are retried until the port has memory.
void PostSurely(CompletionPort& port, void* packet) noexcept {
  for (;;) {
    try {
      port.Post(packet);
      return;
    } catch (const std::bad_alloc&) {
      std::this_thread::yield();
    }
  }
}

}  // namespace

struct ThreadedWorkQueue::Core {
  struct Delayed {
    std::int64_t due;
    std::uint64_t order;
    AllocatedFunction* item;
  };
  struct Later {
    bool operator()(const Delayed& a, const Delayed& b) const noexcept {
      return a.due != b.due ? a.due > b.due : a.order > b.order;
    }
  };

  Core(const std::string& queueName, int count, Clock& queueClock)
      : name(queueName), threadCount(count), clock(queueClock) {}
  ~Core();

  void WorkerMain();
  // Moves the due functions to the port. With `designate`, when functions remain and
  // no worker waits for them, makes the caller that worker: returns its token and sets
  // `timeout` to the real time until the earliest.
  std::uint64_t MoveDueFunctions(bool designate, std::int64_t& timeout);
  bool IsWorkerThread() const noexcept;
  void JoinOrDetachWorkers(bool detach);

  const std::string name;
  const int threadCount;
  Clock& clock;
  CompletionPort port;

  std::mutex heapMutex;  // guards the heap, nextOrder and lastToken
  utility::SmallBlockAllocator::vector<Delayed> heap;
  std::uint64_t nextOrder = 0;
  std::uint64_t lastToken = 0;
  std::atomic<std::size_t> heapSize{0};
  // The token of the one worker sleeping until the earliest due time; 0 when none. A
  // caller whose function becomes the earliest clears it and posts a wake-up.
  std::atomic<std::uint64_t> timedWaiter{0};

  Gate pauseGate{false};  // opened once construction is complete
  std::mutex stateMutex;  // serialises Pause, Resume and Terminate
  std::atomic<bool> terminated{false};
  // CallAsynchronously and Flush calls between their check of `terminated` and their
  // post: Terminate waits for them, so that nothing is posted behind the stop requests.
  std::atomic<int> posting{0};

  std::mutex flushMutex;  // one Flush at a time: two would split the workers between them
  std::mutex joinMutex;   // guards threads and joined
  std::vector<std::thread> threads;
  bool joined = false;
};

namespace {

thread_local const ThreadedWorkQueue::Core* currentQueue = nullptr;

// Counts a post in progress; see Core::posting.
class PostingScope {
 public:
  explicit PostingScope(ThreadedWorkQueue::Core& core) : core_(core) {
    core_.posting.fetch_add(1, std::memory_order_seq_cst);
  }
  ~PostingScope() { core_.posting.fetch_sub(1, std::memory_order_seq_cst); }
  PostingScope(const PostingScope&) = delete;
  PostingScope& operator=(const PostingScope&) = delete;

 private:
  ThreadedWorkQueue::Core& core_;
};

}  // namespace

ThreadedWorkQueue::Core::~Core() {
  while (void* packet = port.TryTake()) {
    if (packet != &wakeUpPacket && packet != &stopPacket) {
      delete static_cast<AllocatedFunction*>(packet);
    }
  }
  for (const Delayed& entry : heap) delete entry.item;
}

bool ThreadedWorkQueue::Core::IsWorkerThread() const noexcept {
  return currentQueue == this;
}

std::uint64_t ThreadedWorkQueue::Core::MoveDueFunctions(bool designate, std::int64_t& timeout) {
  timeout = -1;
  std::lock_guard<std::mutex> lock(heapMutex);
  if (terminated.load(std::memory_order_acquire)) return 0;
  const std::int64_t now = clock.NowMicroseconds();
  while (!heap.empty() && heap.front().due <= now) {
    try {
      port.Post(heap.front().item);
    } catch (const std::bad_alloc&) {  // look again soon
      timeout = 1000;
      return 0;
    }
    std::pop_heap(heap.begin(), heap.end(), Later());
    heap.pop_back();
    heapSize.store(heap.size(), std::memory_order_release);
  }
  if (!designate || heap.empty() || timedWaiter.load(std::memory_order_acquire) != 0) return 0;
  const std::uint64_t token = ++lastToken;
  timedWaiter.store(token, std::memory_order_release);
  timeout = clock.RealWaitMicroseconds(heap.front().due - now);
  return token;
}

void ThreadedWorkQueue::Core::WorkerMain() {
  currentQueue = this;
  for (;;) {
    std::int64_t timeout = -1;
    std::uint64_t token = 0;
    if (heapSize.load(std::memory_order_acquire) != 0) token = MoveDueFunctions(true, timeout);
    void* packet = port.Take(timeout);
    if (token != 0) {
      // Give up the timed wait; if a function came instead of the time-out, let an idle
      // worker take the wait over while this one runs it.
      const bool stillMine = timedWaiter.compare_exchange_strong(token, 0);
      if (stillMine && packet != nullptr && packet != &wakeUpPacket && threadCount > 1 &&
          heapSize.load(std::memory_order_acquire) != 0) {
        PostSurely(port, &wakeUpPacket);
      }
    }
    if (packet == nullptr || packet == &wakeUpPacket) continue;
    if (packet == &stopPacket) break;
    auto* item = static_cast<AllocatedFunction*>(packet);
    pauseGate.PassThrough(-1);
    RunReportingExceptions(item->fn, kThreadedWorkQueueSite);
    delete item;
  }
  currentQueue = nullptr;
}

void ThreadedWorkQueue::Core::JoinOrDetachWorkers(bool detach) {
  std::lock_guard<std::mutex> lock(joinMutex);
  if (joined) return;
  for (std::thread& thread : threads) {
    if (!thread.joinable()) continue;
    // A worker never joins itself.
    if (detach || thread.get_id() == std::this_thread::get_id()) {
      thread.detach();
    } else {
      thread.join();
    }
  }
  joined = true;
}

ThreadedWorkQueue::ThreadedWorkQueue(const std::string& name, int threadCount,
                                     ThreadPriority priority,
                                     const boost::function<void()>& threadStart,
                                     const boost::function<void()>& threadEnd, Clock& clock)
    : core_(boost::make_shared<Core>(name, threadCount, clock)) {
  core_->threads.reserve(static_cast<std::size_t>(threadCount));
  try {
    for (int i = 0; i < threadCount; ++i) {
      const boost::shared_ptr<Core> core = core_;
      core_->threads.push_back(CreateNamedThread(name, priority, threadStart, threadEnd,
                                                 [core] { core->WorkerMain(); }));
    }
  } catch (...) {
    Terminate();
    core_->JoinOrDetachWorkers(false);
    throw;
  }
  core_->pauseGate.Open();  // last: no function starts before construction is complete
}

ThreadedWorkQueue::~ThreadedWorkQueue() {
  Terminate();
  core_->JoinOrDetachWorkers(core_->IsWorkerThread());
}

bool ThreadedWorkQueue::CallAsynchronously(const boost::function<void()>& fn,
                                           unsigned int delayMilliseconds) {
  if (fn.empty()) return false;
  Core& core = *core_;
  PostingScope posting(core);
  if (core.terminated.load(std::memory_order_seq_cst)) return false;
  auto* item = new AllocatedFunction(fn);
  if (delayMilliseconds == 0) {
    try {
      core.port.Post(item);
    } catch (...) {
      delete item;
      throw;
    }
    return true;
  }
  const std::int64_t due =
      core.clock.NowMicroseconds() + static_cast<std::int64_t>(delayMilliseconds) * 1000;
  bool wake = false;
  {
    std::lock_guard<std::mutex> lock(core.heapMutex);
    try {
      core.heap.push_back(Core::Delayed{due, core.nextOrder++, item});
    } catch (...) {
      delete item;
      throw;
    }
    std::push_heap(core.heap.begin(), core.heap.end(), Core::Later());
    core.heapSize.store(core.heap.size(), std::memory_order_release);
    // The worker sleeping until the old earliest time would sleep too long, and with
    // no such worker nobody watches the heap: either way, have a worker look again.
    if (core.heap.front().item == item || core.timedWaiter.load() == 0) {
      core.timedWaiter.store(0, std::memory_order_release);
      wake = true;
    }
  }
  // A lone worker queuing for itself looks at the heap again before it sleeps.
  if (wake && !(core.threadCount < 2 && core.IsWorkerThread())) {
    PostSurely(core.port, &wakeUpPacket);
  }
  return true;
}

int ThreadedWorkQueue::GetThreadCount() const {
  return core_->threadCount;
}

void ThreadedWorkQueue::Terminate() {
  Core& core = *core_;
  {
    std::lock_guard<std::mutex> lock(core.stateMutex);
    if (core.terminated.load(std::memory_order_relaxed)) return;
    core.terminated.store(true, std::memory_order_seq_cst);
  }
  while (core.posting.load(std::memory_order_seq_cst) != 0) std::this_thread::yield();
  for (int i = 0; i < core.threadCount; ++i) PostSurely(core.port, &stopPacket);
  core.pauseGate.Open();  // paused workers go on to their stop requests
}

bool ThreadedWorkQueue::IsTerminated() const {
  return core_->terminated.load(std::memory_order_acquire);
}

bool ThreadedWorkQueue::IsCurrentThreadExecutorThread() const {
  return core_->IsWorkerThread();
}

void ThreadedWorkQueue::Flush() {
  Core& core = *core_;
  if (core.IsWorkerThread()) {
    debug::ReportAssertion("!IsCurrentThreadExecutorThread()", __FILE__, __LINE__,
                           "kelcore::threads::ThreadedWorkQueue::Flush",
                           "Flush on one of the queue's own workers would wait for itself; "
                           "it returns at once.");
    return;
  }
  std::lock_guard<std::mutex> flushLock(core.flushMutex);
  // One barrier call per worker: a worker blocked at the barrier takes no other packet,
  // so each worker takes exactly one, after everything queued before it. All are made
  // before any is posted, so that running out of memory cannot leave the barrier short.
  SyncPoint allDone(static_cast<unsigned int>(core.threadCount) + 1);
  const boost::function<void()> arrive = [allDone]() mutable { allDone.Wait(); };
  std::vector<std::unique_ptr<AllocatedFunction>> arrivals;
  arrivals.reserve(static_cast<std::size_t>(core.threadCount));
  for (int i = 0; i < core.threadCount; ++i) {
    arrivals.push_back(std::make_unique<AllocatedFunction>(arrive));
  }
  bool terminated = false;
  {
    PostingScope posting(core);
    terminated = core.terminated.load(std::memory_order_seq_cst);
    if (!terminated) {
      std::int64_t unused = 0;
      if (core.heapSize.load(std::memory_order_acquire) != 0) core.MoveDueFunctions(false, unused);
      for (auto& arrival : arrivals) PostSurely(core.port, arrival.release());
    }
  }
  if (terminated) {
    // Terminate has posted the stop requests (it waited for the scope above): the
    // workers end once the functions queued before them have run.
    core.JoinOrDetachWorkers(false);
    return;
  }
  allDone.Wait();
}

void ThreadedWorkQueue::Pause() {
  std::lock_guard<std::mutex> lock(core_->stateMutex);
  if (!core_->terminated.load(std::memory_order_relaxed)) core_->pauseGate.Close();
}

void ThreadedWorkQueue::Resume() {
  std::lock_guard<std::mutex> lock(core_->stateMutex);
  if (!core_->terminated.load(std::memory_order_relaxed)) core_->pauseGate.Open();
}

void ThreadedWorkQueue::WaitWhilePaused() {
  {
    std::lock_guard<std::mutex> lock(core_->stateMutex);
    if (core_->terminated.load(std::memory_order_relaxed)) return;
  }
  core_->pauseGate.PassThrough(-1);
}

void ThreadedWorkQueue::ClockChanged() {
  core_->timedWaiter.store(0, std::memory_order_release);
  PostSurely(core_->port, &wakeUpPacket);
}

}  // namespace kelcore::threads::detail
