// AsyncExecutor: something that runs functions asynchronously.
//
// Executors are always held by boost::shared_ptr. Every operation may be called from
// any thread, including from a function the executor is running. A function handed to
// an executor runs with none of the library's process-wide locks held, and never on the
// calling thread inside CallAsynchronously.
//
// Ordering. Each executor states its own guarantees; what all of them share: functions
// queued without delay start in the order of their CallAsynchronously calls as seen
// by the executor (with more than one thread they may overlap and finish in any order),
// and a delayed function is never started before its delay has passed.
//
// Memory ordering. Everything the caller did before CallAsynchronously happens-before
// the function starts. For AsyncThreadedExecutor, everything the functions covered by a
// Flush did happens-before that Flush returns. On an executor that runs one function at
// a time (one thread, or a sub-executor of concurrency 1), each function
// happens-before the next one starts.
//
// Failures. CallAsynchronously refuses (returns false) an empty function and any
// function once the executor is terminated; the function is then dropped without
// running. It throws std::bad_alloc when the function's copy cannot be allocated; the
// function is then not queued.
//
// Termination. Terminate refuses new work from then on; what happens to work already
// queued is the executor's own contract (the library's executors let functions that are
// already running finish). Destroying an executor never waits for delayed functions:
// those whose delay has not passed are destroyed without running.
#pragma once

#include <kelcore/Export.h>

#include <boost/function.hpp>

namespace kelcore::threads {

class KELCORE_API AsyncExecutor {
 public:
  virtual ~AsyncExecutor();

  // Schedules `fn` to run after at least `delayMilliseconds` (0: as soon as possible).
  // Returns whether it was accepted. Throws std::bad_alloc when the item cannot be
  // allocated.
  virtual bool CallAsynchronously(const boost::function<void()>& fn,
                                  unsigned int delayMilliseconds) = 0;

  // How many of this executor's functions may run at once. For the thread pool's
  // executors this informs sub-executors and does not limit the pool.
  virtual int GetThreadCount() const = 0;

  // Stops accepting work and shuts down. Calling it again does nothing.
  virtual void Terminate() = 0;
  virtual bool IsTerminated() const = 0;
};

// An executor with threads of its own (or a view of some) that can be flushed and
// paused. Clients may derive from it.
class KELCORE_API AsyncThreadedExecutor : public AsyncExecutor {
 public:
  AsyncThreadedExecutor();
  ~AsyncThreadedExecutor() override;

  // True when called on one of this executor's own threads (for a sub-executor: on a
  // thread that is running one of its functions).
  virtual bool IsCurrentThreadExecutorThread() const = 0;
  // Returns when every function submitted without delay before the call (and every
  // delayed function already due) has finished. A sub-executor's Flush called from one
  // of its own functions returns at once; a threaded work queue's must not be called
  // from its own workers (it reports the misuse and returns at once).
  virtual void Flush() = 0;
  // Stops starting new functions; running ones finish. Queued functions stay queued.
  virtual void Pause() = 0;
  // Starts functions again, beginning with those held back by Pause.
  virtual void Resume() = 0;
  // Blocks the caller while the executor is paused (a sub-executor returns at once).
  virtual void WaitWhilePaused() = 0;
};

}  // namespace kelcore::threads
