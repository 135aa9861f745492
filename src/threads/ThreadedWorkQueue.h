// ThreadedWorkQueue: a named set of dedicated worker threads fed by a completion port;
// CreateAsyncThreadedExecutor returns one.
//
// Functions queued without delay start in the order they were queued (with one worker
// they also finish in that order). A delayed function waits in a min-heap by due time,
// never on a worker: whichever worker next looks at the heap moves the due functions
// to the port (due time, then queuing order), and one idle worker at a time sleeps with
// a time-out until the earliest due time. An exception escaping a function is reported
// through the assert facility (see WorkerExceptionReport.h) and the worker goes on.
//
// Pause closes the gate that workers pass before each function: a worker that has
// taken a function holds it until Resume. Flush returns once every function queued
// before it (and every delayed function already due) has finished; it waits across a
// pause. Terminate refuses new work; functions already queued still run, ahead of the
// stop requests, and delayed functions not yet due are destroyed unrun when the queue
// is destroyed. The destructor terminates and joins the workers; when it runs on one of
// the queue's own workers (the last reference dropped there) it detaches them instead,
// and they end on their own after the queued functions.
#pragma once

#include <kelcore/threads/AsyncExecutor.h>
#include <kelcore/threads/NamedThread.h>

#include "threads/Clock.h"

#include <boost/function.hpp>
#include <boost/shared_ptr.hpp>

#include <string>

namespace kelcore::threads::detail {

class ThreadedWorkQueue final : public AsyncThreadedExecutor {
 public:
  // Starts `threadCount` (>= 1) workers named `name`. Throws std::system_error when a
  // worker cannot be started (those already started are stopped first).
  ThreadedWorkQueue(const std::string& name, int threadCount, ThreadPriority priority,
                    const boost::function<void()>& threadStart,
                    const boost::function<void()>& threadEnd, Clock& clock = SteadyClock());
  ~ThreadedWorkQueue() override;

  bool CallAsynchronously(const boost::function<void()>& fn,
                          unsigned int delayMilliseconds) override;
  int GetThreadCount() const override;
  void Terminate() override;
  bool IsTerminated() const override;
  bool IsCurrentThreadExecutorThread() const override;
  void Flush() override;
  void Pause() override;
  void Resume() override;
  void WaitWhilePaused() override;

  // For a clock moved by hand: have a worker look at the delayed functions again.
  void ClockChanged();

  struct Core;

 private:
  boost::shared_ptr<Core> core_;  // shared with the workers, which may outlive this object
};

}  // namespace kelcore::threads::detail
