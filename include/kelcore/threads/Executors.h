// The library's executors: the process's CPU-bound and I/O-bound executors, threaded
// work queues, sub-executors and borrowed single-threaded executors.
//
// The current CPU-bound and I/O-bound executors are held weakly: the library never keeps
// an executor alive by itself. Reading or changing them, and borrowing or returning a
// temporary executor, take one process-wide mutex, which is never held while a function
// runs.
//
// The CPU-bound and I/O-bound executors run on the library's own process-wide thread
// pool: a fixed set of workers (one per processor) for CPU-bound calls, a set for long
// calls that grows while its calls are stuck (blocked on I/O, say) and shrinks when
// idle, and one timer thread that holds delayed calls until they fall due, so a waiting
// call never occupies a worker. Threads start on first use. Calls without delay start in
// posting order; an exception escaping a call is reported through the assert facility
// and swallowed. Terminate does nothing on them and IsTerminated stays false. Destroying
// one cancels its delayed calls that are still pending (they are destroyed unrun); its
// calls without delay still run.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/threads/AsyncExecutor.h>
#include <kelcore/threads/NamedThread.h>

#include <boost/function.hpp>
#include <boost/shared_ptr.hpp>

#include <string>

namespace kelcore::threads {

using AsyncExecutorPtr = boost::shared_ptr<AsyncExecutor>;
using AsyncThreadedExecutorPtr = boost::shared_ptr<AsyncThreadedExecutor>;

// Return the current executor of that kind if one is alive; otherwise make one on the
// process's thread pool (CPU-bound: GetThreadCount() == CPUCount(); I/O-bound: 4, for
// long calls), record it as current and return it.
KELCORE_API AsyncExecutorPtr CreateCPUBoundExecutor();
KELCORE_API AsyncExecutorPtr CreateIOBoundExecutor();
// The current executor of that kind, or empty when none is alive. Never makes one.
KELCORE_API AsyncExecutorPtr GetCPUBoundExecutor();
KELCORE_API AsyncExecutorPtr GetIOBoundExecutor();
// Make `executor` the current one of that kind, but only when none is alive; otherwise
// the call does nothing and the live executor stays current.
KELCORE_API void SetCPUBoundExecutor(const AsyncExecutorPtr& executor);
KELCORE_API void SetIOBoundExecutor(const AsyncExecutorPtr& executor);

// A threaded work queue: `threadCount` dedicated workers (a negative count means that
// many per processor: -threadCount * CPUCount()), each made by CreateNamedThread with
// `name`, `priority`, `threadStart` and `threadEnd`. Throws std::invalid_argument when
// the count comes to less than 1 or more than 1024 workers, and std::system_error when a
// worker cannot be started.
//
// Functions queued without delay start in queuing order (with one worker they run one
// at a time in that order). Delayed functions wait in a heap by due time, never on a
// worker. An exception escaping a function is reported through the assert facility,
// with the expression "false", the message
//   WorkerMain(): caught std exception of type "<type>", what() returned "<what>". Continuing.
// (or "WorkerMain(): caught unknown exception. Continuing."), and the worker goes on.
// Pause holds back functions not yet started (a worker waits with the one it took);
// WaitWhilePaused blocks while paused. Flush waits across a pause, and must not be
// called from the queue's own workers. Terminate refuses new work; the functions
// already queued still run, then the workers end (a Flush after Terminate joins them).
// The destructor terminates and joins the workers; if the last reference is dropped on
// one of its own workers, the workers are detached and end on their own.
KELCORE_API AsyncThreadedExecutorPtr CreateAsyncThreadedExecutor(
    const std::string& name, int threadCount, ThreadPriority priority,
    const boost::function<void()>& threadStart, const boost::function<void()>& threadEnd);

// Sub-executors: run their functions on `parent`, at most an effective concurrency at a
// time: min(maxConcurrent, parent->GetThreadCount()) for maxConcurrent >= 0,
// parent->GetThreadCount() * -maxConcurrent for a negative value. When that comes to 0
// (no parent, maxConcurrent 0, a parent of no threads) the factories return an empty
// pointer. GetThreadCount returns the effective concurrency.
//
// Order. The queue-based kind starts functions queued without delay in queuing order;
// with concurrency 1 it runs them strictly one at a time in that order. With more, they
// start in order but may overlap and finish in any order. The stack-based kind starts
// the most recently queued ready function first. A delayed function joins the order
// when its delay expires.
//
// Flush waits until every function queued before it has finished (not only the last
// one); from inside one of the sub-executor's own functions it returns at once.
// Pause holds back functions not yet started; Resume starts them. WaitWhilePaused does
// nothing. Terminate refuses new work and drops the functions still queued (destroyed
// at once); running ones finish. If the parent refuses work (it was terminated), the
// sub-executor terminates itself. An exception escaping a function reaches the parent
// (which reports it) after the sub-executor's own books are settled. The sub-executor
// keeps the parent alive; destroying the sub-executor lets functions already queued run
// and drops its delayed functions not yet due.
KELCORE_API AsyncThreadedExecutorPtr CreateQueueBasedSubExecutor(const AsyncExecutorPtr& parent,
                                                                 int maxConcurrent);
// The same as CreateQueueBasedSubExecutor.
KELCORE_API AsyncThreadedExecutorPtr CreateSubExecutor(const AsyncExecutorPtr& parent,
                                                       int maxConcurrent);
KELCORE_API AsyncExecutorPtr CreateStackBasedSubExecutor(const AsyncExecutorPtr& parent,
                                                         int maxConcurrent);
// A queue-based sub-executor that runs each function `f` as `wrapper(f)` (to set up
// per-call context); an empty wrapper runs `f` itself.
KELCORE_API AsyncThreadedExecutorPtr CreateSubExecutorWithFunctionWrapper(
    const AsyncExecutorPtr& parent, int maxConcurrent,
    const boost::function<void(const boost::function<void()>&)>& wrapper);

// Borrow a single-threaded executor ("Temporary Thread", normal priority): a spare one
// returned earlier (resumed), or a new one. Return it when done with it: up to two
// returned executors are kept paused as spares; a further one is terminated. Functions
// still queued on a returned executor run when it is next borrowed (or, for a
// terminated one, before its worker ends), so flush it before returning it. Returning
// an empty pointer, or a spare already returned, does nothing.
KELCORE_API AsyncThreadedExecutorPtr BorrowTemporarySingleThreadedExecutor();
KELCORE_API void ReturnTemporarySingleThreadedExecutor(const AsyncThreadedExecutorPtr& executor);

}  // namespace kelcore::threads
