// WorkerSet: a group of the thread pool's worker threads sharing one ready queue.
//
// The base workers start with the first post. A set that may grow has its growth timer
// check it periodically while calls wait and no worker is idle (a post that finds no
// idle worker, or a worker that takes a call with others waiting behind it, arms the
// check); each check that finds calls waiting and none taken since the last check starts
// one more worker, up to the maximum: work that blocks for long (I/O) makes the set
// grow, a flood of short calls does not. Workers above the base end after sitting idle
// for the idle time. Never one thread per call.
//
// Workers run calls in the order they were posted (calls may overlap and finish in any
// order). An exception escaping a call is reported through the assert facility and
// swallowed. A delayed call whose executor has been destroyed is dropped unrun.
//
// Post may be called from any thread. Destroying the set lets the calls already posted
// run, then waits until every worker has ended.
#pragma once

#include "threads/CompletionPort.h"
#include "threads/FunctionItems.h"

#include <boost/shared_ptr.hpp>

#include <atomic>
#include <cstdint>
#include <string>

namespace kelcore::threads::detail {

class DelayedCallTimer;

class WorkerSet {
 public:
  struct Limits {
    int baseThreads;
    int maxThreads;                 // maxThreads > baseThreads makes the set grow
    std::int64_t idleMicroseconds;  // before a worker above the base ends
    std::int64_t growthCheckMicroseconds;
  };

  // `growthTimer` runs the growth checks; it must outlive the set's last post.
  WorkerSet(std::string threadName, Limits limits, DelayedCallTimer* growthTimer);
  ~WorkerSet();
  WorkerSet(const WorkerSet&) = delete;
  WorkerSet& operator=(const WorkerSet&) = delete;

  // Takes ownership of `call`. Throws std::bad_alloc, or std::system_error when the
  // set has no worker and none can be started (the call is then destroyed).
  void Post(PoolFunction* call);
  // The growth check: starts a worker if calls wait and none was taken since the last
  // check. Returns whether to check again.
  bool CheckGrowth();

  int LiveWorkers() const noexcept;

 private:
  struct State;
  static void WorkerMain(const boost::shared_ptr<State>& state);
  void StartBaseWorkers();
  bool TryStartWorker();

  boost::shared_ptr<State> state_;  // shared with the workers
};

}  // namespace kelcore::threads::detail
