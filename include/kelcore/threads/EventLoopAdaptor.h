// AsyncEventLoopAdaptor: a thread that runs an event loop, seen as an executor.
//
// Functions handed to an adaptor run on the adapted thread (the thread that created
// it), inside its event loop (kelcore/threads/PlatformEventLoop.h), so they run only
// while that thread pumps its loop: in RunPlatformEventLoop, in
// DispatchPlatformEventLoopMessages, or in the adaptor's own Flush.
//
// CallAsynchronously(fn, 0) appends `fn` to the adaptor's pending calls and asks the
// loop to run them; pending calls run in the order in which they were accepted, whatever
// thread posted them. A request from the adapted thread queues behind the thread's
// earlier messages; a request from another thread is taken ahead of the thread's own
// posted messages (so cross-thread calls are not held up behind, say, delayed calls that
// have fired). CallAsynchronously(fn, delay > 0) spends the delay on the process's
// CPU-bound executor (CreateCPUBoundExecutor, taken once when the adaptor is made and
// kept while it is live) and then posts `fn` to the loop on its own; it does not join
// the pending calls. An empty `fn` is refused (false). A terminated adaptor refuses
// work (false), as does one whose thread has ended; delayed calls that fire after
// termination are dropped. All operations may be called from any thread.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/threads/AsyncExecutor.h>

#include <boost/shared_ptr.hpp>

namespace kelcore::threads {

class KELCORE_API AsyncEventLoopAdaptor : public AsyncExecutor {
 public:
  AsyncEventLoopAdaptor();
  ~AsyncEventLoopAdaptor() override;

  // True on the adapted thread.
  virtual bool IsCurrentThreadExecutorThread() const = 0;

  // On the adapted thread: runs the pending calls one after another until none is left
  // (calls accepted meanwhile included); delayed calls are not affected. On any other
  // thread the call is a contract violation: it is reported through the assert
  // facility and returns at once, since the calls must not run on the wrong thread.
  virtual void Flush() = 0;
};

using AsyncEventLoopAdaptorPtr = boost::shared_ptr<AsyncEventLoopAdaptor>;

// Adapts the calling thread's event loop. GetThreadCount() of the result is 1.
// Terminate() stops accepting work and, when `quitLoopOnTerminate` is true, posts a quit
// message to the adapted thread, which ends its RunPlatformEventLoop (the main thread's
// registration and the event-loop executors pass true; a host that pumps the queue from
// its own loop and outlives the adaptor may pass false). Calls already accepted stay
// queued and run if the loop reaches them before the quit message. Throws
// std::system_error when the thread's queue cannot be made.
KELCORE_API AsyncEventLoopAdaptorPtr AdaptCurrentEventLoopAsExecutor(bool quitLoopOnTerminate);

}  // namespace kelcore::threads
